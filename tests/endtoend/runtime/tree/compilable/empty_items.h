@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace empty_items
{

$variant Command { default stop(); { } stop; { int32 x; } go; *{ } boxed; void none; };
$variant+ Shown { default 1; int32; { } stop; };

}

// One brace for two names, around text that stands outside of them.
namespace empty_items::inner
{

$class+ Head { public: $int32 x; };
$variant+ Slot { default free(); void free; int32; };

}
