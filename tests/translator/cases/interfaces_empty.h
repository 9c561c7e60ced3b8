@import "Vesk/vxObject/IObject.h"
$interface I { };
