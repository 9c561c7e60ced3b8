@import "Vesk/vxObject/IObject.h"
$struct S
{//
$dep void d = { go();
done(); };
int end;
};
