@import "Vesk/vxObject/IObject.h"
$struct S
{//
$cache <<async>> int32 f(int32 a, bool b) const with string8 in { in = $$; } { return size(in); }
int end;
};
