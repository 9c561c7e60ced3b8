@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace nested
{


$class+ Outer isa vesk::IObject
{
public:
    $functor int32 Callback(int32 a, const string8& b);
    $functor void Action();
    $struct Size : model { int32 width; string8 name; } { };
    $class Part : model { xvector<int32> items; } { };
    $struct Deep
    {
        $struct Inner : model { int32 a; } { };
        Inner inner;
    };
    $variant Value { int32; string8; float64 ratio; void nothing; { int32 x; int32 y; } point; *Size; };
    $variant Shown { default 3; int32; xvector<int32> list; };
    Size size;
    Value value;
};
$struct Holder
{
    $variant Choice { void; int32; };
};

}
