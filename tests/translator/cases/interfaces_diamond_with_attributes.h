@import "Vesk/vxObject/IObject.h"
$interface+ A { void a(int32 i); };
$interface+ K : A { int32 k() const; };
$interface+ L : A { };
$interface+ D : [ "doc" ] : K, L { void d(const string8& s, int32 n=3) : [ "m" ]; int32 v; const bool w; };
