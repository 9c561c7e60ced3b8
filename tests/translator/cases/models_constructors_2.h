@import "Vesk/vxObject/IObject.h"
$model M { int32 a; $$() { a = 7; } };
