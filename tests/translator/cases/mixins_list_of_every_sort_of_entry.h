@import "Vesk/vxObject/IObject.h"
$mixin M << reflect >> { $int32 a; };
$model Pos { bool y; };
namespace n { $mixin T { }; }
$class+ K : mixin [ M { $bool b; int plain; } Pos ? other::U <int, 3> n::T<char> model { int8 z; } ]
{
};
