@import "Vesk/vxObject/IObject.h"
$enum+ class Level : [ "doc" ] { low, default -mid, high = 8 + 2, top, };
