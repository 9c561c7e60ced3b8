@import "Vesk/vxObject/IObject.h"
$struct+ S { $visit { } };
