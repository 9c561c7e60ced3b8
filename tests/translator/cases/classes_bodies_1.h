@import "Vesk/vxObject/IObject.h"
$struct A
{$$() { $$ * p; if (x) { } }};