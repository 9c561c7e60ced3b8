@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace templates
{

$model Base { int32 shared; };
struct Plain { int32 plain = 1; };
template <typename T> struct PlainOf { T plain = T(); };
$struct Box<typename T> : model { int32 count; string8 name; } { T item; };
$struct Archived<typename T> <<ar os>> : model { string8 item; }
{
    void Write(vesk::xostream& os) const { os << "item " << this->model().item; }
};
$struct Referring<typename T> : model Base { T extra; };
$class Kept<typename T> isa vesk::IPersistable : model { int32 item; } { };
$struct Printed<typename K, typename V> : model { xmap<int32,string8> map; } { };
$struct Body<typename T> { $model { int32 a; string8 text; } };
$struct Derived<typename T> : Plain, PlainOf<T> model { int32 a; } { };
$struct Old<typename T> : model
{
    int32 a;
    int32 b;
    $schema { 1: +a 2: +b }
    $evolve { b(a) { b = a + 1; } }
} { };
$mixin Adds<typename T> : PlainOf<T> model { int32 added; } { };
$struct Lists<typename T> : mixin [ Adds<T> ] { };
$struct Concrete : mixin [ Adds<int32> ] { };

}
