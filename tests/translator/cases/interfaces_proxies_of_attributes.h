@import "Vesk/vxObject/IObject.h"
$interface I { const xmap<string8,string8> m; const xmap<int32,xset<int8> > s; };
