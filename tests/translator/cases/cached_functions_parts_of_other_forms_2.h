@import "Vesk/vxObject/IObject.h"
$struct S
{//
$cache int32 f(int32 const& a) const { }
int end;
};
