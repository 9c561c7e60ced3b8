@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace short_bodies
{


$class+ Doubles isa vesk::IObject
{
public:
    $indep int32 b;
    $dep int32 a = b + 1;
    $dep int32 twice = a * 2;
    $cache <<async>> int32 later(int32 n) const with int32 in = b + n; { return in * 2; }
};

}
