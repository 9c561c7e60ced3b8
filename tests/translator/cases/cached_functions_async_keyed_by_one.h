@import "Vesk/vxObject/IObject.h"
$mixin M
{//
$cache <<io async -io>> int32 f(string8 const& k = "") const { }
int end;
};
