@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace polymorphic
{

$variant Shape { default int32(0); int32; int32 side; float64; string8 name; { int32 x; int32 y; } point; *{ int32 r; } boxed; };
inline int32 Area(int32 const& side) { return side * side; }
inline int32 Area(vesk::float64 const& radius) { return int32(radius); }
inline int32 Area(vesk::string8 const& name) { return int32(name.size()); }
inline int32 Area(Shape::point const& p) { return p.x * p.y; }
inline int32 Area(Shape::boxed const& b) { return b.r + 1; }
$polymorphic+ inline int32 Area([Shape shape]);

$variant Left { int32 a; string8 b; };
template <typename A, typename B>
inline void Meet(A const&, B const&, vesk::string8& out) { out += sizeof(A) == sizeof(vesk::int32) ? "a" : "b"; out += sizeof(B) == sizeof(vesk::int32) ? "a" : "b"; }
$polymorphic inline void Meet([const Left& left], [const Left& right], string8& out);

}
