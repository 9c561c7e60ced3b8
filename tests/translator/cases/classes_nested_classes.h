@import "Vesk/vxObject/IObject.h"
$struct A
{
    $class B;
    $struct C <<os>>
    {
        $int32 x;
        $class D { };
    };
};
