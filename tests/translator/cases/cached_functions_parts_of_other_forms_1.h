@import "Vesk/vxObject/IObject.h"
$struct S
{//
$cache ^ void f(bool& b) const { }
int end;
};
