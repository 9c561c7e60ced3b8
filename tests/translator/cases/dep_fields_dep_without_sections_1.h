@import "Vesk/vxObject/IObject.h"
$struct S
{//
$dep int32 a = b + 1;
int end;
};
