@import "Vesk/vxObject/IObject.h"
$interface+ I : vesk::IPersistable { }; $interface J : vesk::IObject { }; $interface+ K : J { };
$warning(disable: 1013) $struct A isa K, I { };