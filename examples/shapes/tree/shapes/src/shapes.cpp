@import "api/point.h"
@import "api/shape.h"
@import "api/kinds.h"

#include <cmath>

vxDefineTarget(shapes, 1)

namespace geo
{

float64 Point::DistanceTo(const Point& other) const { return std::hypot(other.x - x, other.y - y); }

float64 Box::Area() const { return std::fabs((corners[1].x - corners[0].x) * (corners[1].y - corners[0].y)); }

void Drawing::Draw(vesk::ptr<IShape> shape, const vesk::string8& layer)
{
    for (Layer& known : m_layers)
    {
        if (known.name != layer) continue;
        known.shapes.push_back(shape);
        return;
    }
    m_layers.push_back({});
    m_layers.back().Setname(layer);
    m_layers.back().shapes.push_back(shape);
}

vesk::float64 Drawing::Area() const
{
    vesk::float64 sum = 0;
    for (const Layer& layer : m_layers)
    {
        for (const vesk::ptr<IShape>& shape : layer.shapes) sum += shape->Area();
    }
    return sum;
}

$var+ int32 conversions = 0;

vesk::float64 InMetres(vesk::float64 length, Unit unit)
{
    ++conversions;
    return unit == Unit::Millimetre ? length / 1000 : unit == Unit::Inch ? length * 0.0254 : length;
}

}
