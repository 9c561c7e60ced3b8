@import "Vesk/vxObject/IObject.h"
$interface rmi J { };
