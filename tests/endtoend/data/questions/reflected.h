@import "Vesk/vxObject/IObject.h"
namespace geo
{
    $enum+ Side : [ "of a box", [ 1, -2.5, true ], Unit("m", 3) ]
    {
        left = 3,
        right
    };
    $struct+ Point { $int32:[ "low < \"high\" \\ \t" ] x; $xmap<string8,Side> sides; $int32 edge[3]; };
    $function+ Point Move(Point const& from, int32 by = 1 + 2);
    $function+ int32 Move(int32 by);
}
$model+ Note
{
    string8 text;
    $dropped { int32 seconds; }
    $schema { 1: +seconds 4: -seconds +text }
    $evolve { text(seconds) { text = seconds > 0 ? "late" : ""; } }
};
$type+ xvector<xvector<int32> >;
