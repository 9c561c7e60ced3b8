@import "Vesk/vxObject/IObject.h"
$model R { int32 a; };
$mixin M : model R { };
$mixin A << ar >> : model R { };
$struct K : model R { };
