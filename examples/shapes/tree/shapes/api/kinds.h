// The small kinds: an enumeration, variants and a function that dispatches over two of them, a functor, a function, and
// values that recalculate.

@import "Vesk/vxObject/IObject.h"

namespace geo
{

$enum+ class Unit : [ "of a length" ] { Millimetre, default Metre, Inch };

// A length is a count of millimetres or a number of metres; a scale a factor or a percentage.
$variant+ Length { int32; float64; };
$variant+ Scaling { float64; int32; bool; };

inline vesk::string8 Scaled(int32 millimetres, float64 factor) { return vxMakeString(millimetres * factor << " mm"); }
inline vesk::string8 Scaled(int32 millimetres, int32 percent) { return vxMakeString(millimetres * percent / 100 << " mm"); }
inline vesk::string8 Scaled(int32 millimetres, bool) { return vxMakeString(millimetres << " mm as they are"); }
inline vesk::string8 Scaled(float64 metres, float64 factor) { return vxMakeString(metres * factor << " m"); }
inline vesk::string8 Scaled(float64 metres, int32 percent) { return vxMakeString(metres * percent / 100 << " m"); }
inline vesk::string8 Scaled(float64 metres, bool) { return vxMakeString(metres << " m as they are"); }
$polymorphic+ inline string8 Scaled([Length length], [Scaling scaling]);

$functor+ float64 Measure(float64 width, float64 height);

$function+ float64 InMetres(float64 length, Unit unit);

// An area that is calculated when it is read and an edge has changed.
$class+ Canvas isa vesk::IObject
{
public:
    $indep float64 width create { width = 3; };
    $indep float64 height create { height = 2; };
    $dep float64 area = { ++m_calculations; area = width * height; };
    $cache float64 Share(int32 tiles) const { return area / tiles; }

    mutable int32 m_calculations = 0;
};

}
