@import "Vesk/vxObject/IObject.h"
$adt+ A : [ 7 ] { int32 get(int32 i) const; void set(const string8& s); };
