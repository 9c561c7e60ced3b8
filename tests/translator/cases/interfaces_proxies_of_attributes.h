@import "Vesk/vxObject/IObject.h"
$interface I { const xmap<string8,string8> m; };
