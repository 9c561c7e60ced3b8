@import "Vesk/vxObject/IObject.h"
$interface+ I : vesk::IPersistable { }; $interface J : vesk::IObject { };
$warning(disable: 1013) $struct A isa J, I { };