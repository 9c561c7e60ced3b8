@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace nested_models
{

$model Base { int32 shared; };
$mixin Counts { $int32 counter; };

$class+ Outer isa vesk::IObject
{
public:
    $struct Size : model { int32 width; string8 name; } { };
    $class Part : model { xvector<int32> items; } { };
    $struct Deep
    {
        $struct Inner : model { int32 a; } { };
        Inner inner;
    };
    $struct Old : model { int32 a; int32 b; $schema { 1: +a 2: +b } $evolve { b { b = 7; } } } { };
    $struct Body { $model { int32 inBody; string8 text; } };
    $struct Referring : model Base { };
    $struct Listing : mixin [ Counts model { int32 listed; } ] { $int32 Twice() const { return 2 * counter; } };
    $struct Several : Deep model { int32 a; xmap<int32,string8> map; } { };
    $struct Printed <<os ar>>
    {
        int32 x = 0;
        void Write(vesk::xostream& os) const { os << "x=" << x; }
        template <typename Archive> void Serialise(Archive& ar) const { ar << x; }
        void Deserialise(vesk::InputArchive& ar) { ar >> x; }
    };
    $class Persistable isa vesk::IPersistable : model { int32 kept; } { };
    $struct Generic<typename T> : model { int32 count; } { T item; };
    Size size;
private:
    $struct Hidden : model { int32 a; } { };
    Hidden hidden;
};
$struct InTemplate<typename T>
{
    $struct Inner : model { int32 a; } { T item; };
};
}
