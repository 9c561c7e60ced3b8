@import "shapes/shapes.h"

vxDefineTarget(shapes, 1)

namespace shapes {

vesk::string8 Box::Name() const { return "box"; }
$function+ int32 Twice(int32 n) { return 2 * n; }

}
