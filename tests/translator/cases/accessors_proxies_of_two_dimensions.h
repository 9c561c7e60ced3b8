@import "Vesk/vxObject/IObject.h"
$interface+ I : vesk::IObject { };
$enum E { e1 };
$model Inner { bool y; };
$typedef int32 Number;
$class K : model { int32 x[2][3]; } { };
