@import "Vesk/vxObject/IObject.h"
$model M { bool a; bool b; bool c; };
