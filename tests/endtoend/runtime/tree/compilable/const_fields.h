@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace const_fields
{


$class+ Fixed isa vesk::IObject
{
public:
    Fixed() : a(4), b(5), c(6) {}
    $const int32 a;
    $int32 const b;
    $int32 c;
};
$struct+ Plain { Plain() : a(1) {} $const int32 a; };
$mixin Mixed { Mixed() : m(7) {} $const int32 m; };
$class+ Lists isa vesk::IObject : mixin [ Mixed ] { };

}
