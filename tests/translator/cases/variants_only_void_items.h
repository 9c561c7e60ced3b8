@import "Vesk/vxObject/IObject.h"
$variant E <<-os -ar>> { void a; void; };
