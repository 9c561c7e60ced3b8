@import "Vesk/vxObject/IObject.h"
$model M { int32 a; int32 b; $schema { 4: +b +a } };
