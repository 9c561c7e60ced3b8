@import "Vesk/vxObject/IObject.h"
$struct+ S { $model { xmap<int32,xset<bool> > m; assignable<xset<int8> > s[2]; } $int32 n; };
