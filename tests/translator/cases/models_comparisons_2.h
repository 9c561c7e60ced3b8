@import "Vesk/vxObject/IObject.h"
$model M { };
