@import "Vesk/vxObject/IObject.h"
$enum A { a, b = 10, c };
$enum B { d = -2, e, f };
$enum C { g = 0xFFFFFFFF, h };  // the low 32 bits
$enum class D;
$enum E;
$enum E;
