@import "Vesk/vxObject/IObject.h"
@def twice(x) = ((x) + (x))

namespace geo
{
$struct+ Shape <<compare>>
{
    $float64 width;
    $float64 Area(float64 factor) const
    {
        float64 result = width * factor;
        return twice(result);
    }
};
$class+ Circle : model
{
    float64 radius;
}
{
    explicit $$(float64 r) { _model_.radius = r; }
};
}
