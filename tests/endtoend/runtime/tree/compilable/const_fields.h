@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace const_fields
{

$typedef+ const int32 ConstInt;
$class+ Fixed isa vesk::IObject
{
public:
    Fixed() : a(4), b(5), c(6), d(7), text("text") {}
    explicit Fixed(int32 value) : a(value), b(value), c(value), d(value), text("") {}
    $const int32 a;
    $int32 const b;
    $int32 c;
    $ConstInt d;
    $const string8 text;
};
$struct+ Plain { Plain() : a(1), pointer(nullptr) {} $const int32 a; $const int32* pointer; };
$mixin Mixed { Mixed() : m(7) {} $const int32 m; };
$class+ Lists isa vesk::IObject : mixin [ Mixed ] { };
$struct Holds<typename T> : mixin [ Mixed ] { Holds() : own() {} $const int32 own; };

}
