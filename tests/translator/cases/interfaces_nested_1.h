@import "Vesk/vxObject/IObject.h"
$class C
{
    $interface I { void f(); };
    int x;
};
