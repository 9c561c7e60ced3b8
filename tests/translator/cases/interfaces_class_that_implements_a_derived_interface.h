@import "Vesk/vxObject/IObject.h"
$interface+ A : vesk::IObject { };
$interface+ B : A { };
$interface U { };
$class+ K isa U, B { };
