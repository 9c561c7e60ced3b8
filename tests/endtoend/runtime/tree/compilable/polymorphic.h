@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace polymorphic
{


$variant Shape { int32 side; float64; string8 name; { int32 x; int32 y; } point; };
inline int32 Area(int32 const& side) { return side * side; }
inline int32 Area(vesk::float64 const& radius) { return int32(radius); }
inline int32 Area(vesk::string8 const& name) { return int32(name.size()); }
inline int32 Area(Shape::point const& p) { return p.x * p.y; }
$polymorphic+ inline int32 Area([Shape shape]);

}
