@import "Vesk/vxObject/IObject.h"
$enum E <<reflect>> { a, -b = 7 };
