@import "Vesk/vxObject/IObject.h"
$struct S
{//
$cache ^ <<queue(7)>> void f(bool& out, int32 a, string8 const& b, float64 c) const { }
int end;
};
