@import "Vesk/vxObject/IObject.h"
$functor void G();
