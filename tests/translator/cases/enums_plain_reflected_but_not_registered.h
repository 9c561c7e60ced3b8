@import "Vesk/vxObject/IObject.h"
$enum E <<reflect>> : [ "doc" ] { a, -b = 7 };
