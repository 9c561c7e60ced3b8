@import "Vesk/vxObject/IObject.h"
$struct S <<-os>> : model { int32 grid[2][2]; } { S() : c(1) {} $const int32 c; };
