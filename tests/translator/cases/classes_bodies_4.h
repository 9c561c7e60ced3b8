@import "Vesk/vxObject/IObject.h"
$struct A
{$int f(int a) const { return "}"[a]; } $void g();};