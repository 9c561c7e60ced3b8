@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace templates
{

$model Base { int32 shared; };
$struct Box<typename T> : model { int32 count; string8 name; } { T item; };
$struct Archived<typename T> <<ar>> : model { string8 item; } { };
$struct Referring<typename T> : model Base { T extra; };
$class Kept<typename T> isa vesk::IPersistable : model { int32 item; } { };
$struct Printed<typename K, typename V> : model { xmap<int32,string8> map; } { };

}
