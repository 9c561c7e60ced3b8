@import "Vesk/vxObject/IObject.h"
$mixin M
{//
$cache - ^ <<async io>> void f(xvector<int32>& out) const with string8 in = name(); { }
$cache <<io async -io>> int32 g(string8 const& k = "") const { }
int end;
};
