@import "Vesk/vxObject/IObject.h"
$variant A { int32; void n; };
$variant B { string8 x; { bool f; } s; };
$polymorphic int32 f([A a], bool flag = true, [B const& b]);
$polymorphic inline void g([A& a]);
