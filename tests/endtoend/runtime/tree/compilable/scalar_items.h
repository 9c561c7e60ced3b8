@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace scalar_items
{

$enum+ Colour { red, green };
enum Plain { one = 1, two };
typedef Plain Alias;
$typedef Colour Tint;
$variant Items
{
    default int32(7);
    Colour; int32; vesk::float64; bool; string8; *Colour boxed; Colour named; Plain; unsigned octet; Alias alias; Tint tint;
    std::string text; xvector<Colour>; { string8 a; xvector<int32> b; } both;
};
$variant+ Shown { default 1; int32; Colour; uint8 small; };

}
