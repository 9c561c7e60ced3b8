@import "Vesk/vxObject/IObject.h"
$model R { };
$mixin M : model R { };
$mixin A << ar >> : model R { };
