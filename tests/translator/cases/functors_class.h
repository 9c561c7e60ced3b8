@import "Vesk/vxObject/IObject.h"
$functor+ bool F(int32 a = 1, string8 const& b) : [ 7 ];
$functor void G();
