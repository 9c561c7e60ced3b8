@import "Vesk/vxObject/IObject.h"
namespace shop
{
struct Unit { char name[8]{}; int power = 1; double scale = 1; bool operator==(const Unit&) const = default; };
constexpr Unit unit(const char (&name)[3], int power = 1, double scale = 1) { return {{name[0], name[1]}, power, scale}; }
constexpr Unit times(Unit unit, int factor) { unit.power *= factor; return unit; }
inline constexpr Unit bare{};

$struct+ Size
{
    $float64 width : [ unit("mm"), 5, -2147483647 - 1, 2.5, 3.0, true ]; $float64 height : [ bare, times(unit("m ", 2, 1e300), -1) ];
    $int32 counts[4] : [ "a \"text\" \\ of\ttab" ];
    $string8 : [ [ 1, "list", [ ] ], false ] name;
    $int32 plain;
    $void Grow(float64 by : [ unit("mm") ]) { width += by; }
    $indep float64 price : [ unit("eu") ];
    $dep float64 tax : [ unit("eu") ] = { tax = price / 5; };
};
$model+ Place
{
    string8 street : [ "where" ];
    int32 number : [ unit("nr") ];
};
$class+ Shop : model
{
    int32 pieces : [ unit("pc"), 1 ];
    xvector<float64> prices : [ unit("eu") ];
}
{
};
}
