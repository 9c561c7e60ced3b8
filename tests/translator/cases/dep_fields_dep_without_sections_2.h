@import "Vesk/vxObject/IObject.h"
$struct S
{//
$dep ^ int32 a = 1;
int end;
};
