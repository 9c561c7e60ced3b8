@import "Vesk/vxObject/IObject.h"
$variant+ V { xmap<int32,string8>; int32 const*; ptr<ptr<vesk::IObject>>&; };