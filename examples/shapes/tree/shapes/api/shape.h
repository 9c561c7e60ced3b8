// Shapes are objects: they answer interfaces, and tell their class.

@import "Vesk/vxObject/IObject.h"
@import "shapes/api/point.h"

#include <vector>

namespace geo
{

$class Drawing;

$interface+ IShape : vesk::IObject
{
    float64 Area() const;
};

$class+ Circle isa IShape : [ "round" ]
{
public:
    $$(float64 r = 1) : radius(r) {}
    float64 Area() const { return 3.0 * radius * radius; }
    $void Scale(float64 factor) { radius *= factor; }
    $Point centre;
    $float64 radius;
};

$class+ Box final isa IShape
{
public:
    $$() { corners[1].Move(1, 1); }
    float64 Area() const;
    $Point corners[2];
};

// A drawing keeps its shapes in layers, which are no one else's business.
$warning(disable: 1009)
$class+ Drawing isa vesk::IObject
{
public:
    $void Draw(vesk::ptr<IShape> shape, const vesk::string8& layer);
    $float64 Area() const;
    $string8 title;

private:
    $struct Layer
    {
        $string8 name;
        std::vector<vesk::ptr<IShape>> shapes;
    };
    std::vector<Layer> m_layers;
};

$type+ xvector<Point>;

}
