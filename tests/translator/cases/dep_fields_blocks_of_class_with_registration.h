@import "Vesk/vxObject/IObject.h"
namespace n { $class+ S isa vesk::IObject
{//
$evict { drop(); }
$visit { v << x;
v << y; }
}; }
