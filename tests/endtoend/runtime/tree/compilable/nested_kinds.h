@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace nested_kinds
{

$class+ Outer isa vesk::IObject
{
public:
    $functor int32 Callback(int32 a, const string8& b);
    $functor void Action();
    $variant Value
    {
        default int32(2);
        int32; string8; float64 ratio; void nothing; { int32 x; int32 y; } point; *{ string8 a; xvector<int32> b; } boxed; *string8 far;
        cref<Outer> other; { } none;
    };
    $variant Shown { default 3; int32; xvector<int32>; };
    $variant State { void on; void off; };
    Value value;
    State state = State::off();
};
$struct Holder
{
    $struct Deep
    {
        $variant Choice { void; int32; };
        $functor int32 Pick(int32 a);
        Choice choice;
        Pick pick;
    };
    Deep deep;
};
template <typename T>
struct Plain
{
    T value;
};
$class Box<typename T>
{
public:
    $variant Held { void; int32; string8 text; };
    $functor void Changed(int32 a);
    Held held;
    Changed changed;
    T value;
};

}
