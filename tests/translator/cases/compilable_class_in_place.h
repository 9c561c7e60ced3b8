@import "Vesk/vxObject/IObject.h"
$struct S<typename T> <<reflect>> : model { int32 grid[2][2]; }
{
    $int32 f(int32 b) const { return b; }
    $void g() { }
};
$struct C <<-os>> : model { bool a; } { C() : c(1) {} $const int32 c; };
