@import "Vesk/vxObject/IObject.h"
$interface+ I : vesk::IObject { int32 f(int32 a=1) const; void g(); };
$adt A { void h(string8 s); };
$class K isa I { $implementing I { g f }, adt A; };
$class L { $implementing I; };
