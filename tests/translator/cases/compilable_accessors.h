@import "Vesk/vxObject/IObject.h"
$struct S <<-os>> : model { int32 grid[2][2]; } { };
