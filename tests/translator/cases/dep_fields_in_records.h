@import "Vesk/vxObject/IObject.h"
$struct+ S
{
    $dep int32 a = 1;
    $dep void b = { };
    $dep - bool c = true;
    $indep string8 d;
};
