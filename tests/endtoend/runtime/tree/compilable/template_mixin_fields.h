@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace template_mixin_fields
{

$mixin Fields { $int32 a; $string8 name; $indep int32 node; };
$struct Holds<typename T> : mixin [ Fields ] { T value; };
$struct Reflects<typename T> <<reflect>> : mixin [ Fields ] { $int32 value; };
$class Object<typename T> isa vesk::IObject : mixin [ Fields ] { };

}
