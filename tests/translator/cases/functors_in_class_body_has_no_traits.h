@import "Vesk/vxObject/IObject.h"
struct Before;
$struct S
{
    $functor void G();
};
