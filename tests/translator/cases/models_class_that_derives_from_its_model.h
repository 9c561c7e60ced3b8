@import "Vesk/vxObject/IObject.h"
$interface+ I : vesk::IObject { };
$struct+ S << multiline >> isa I : model { pref<I> p; int32 n; } { };
