@import "Vesk/vxObject/IObject.h"
$struct S<typename T> <<reflect>> : model { int32 a; }
{
    $int32 f(int32 b) const { return b; }
    $void g() { }
};
