@import "Vesk/vxObject/IObject.h"
$typedef int32 Three[3] : [ "three" ];
$interface ipc I { void Get([out] int32& n); };
$interface J { string8 s; const Three t; xvector<int32> v; };
