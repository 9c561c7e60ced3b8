@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace scalar_items
{


$enum+ Colour { red, green };
$variant Items { Colour; int32; vesk::float64; bool; string8; *Colour boxed; Colour named; };
$variant+ Shown { default 1; int32; Colour; uint8 small; };

}
