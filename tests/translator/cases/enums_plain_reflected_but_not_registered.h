@import "Vesk/vxObject/IObject.h"
namespace a
{
$enum E <<reflect>> : [ "doc" ] { a, -b = 7 };
}
