@import "Vesk/vxObject/IObject.h"
namespace n { $class+ S
{//
$evict { drop(); }
$visit { v << x;
v << y; }
}; }
