@import "Vesk/vxObject/IObject.h"
namespace more
{
$interface+ INamed : vesk::IObject { string8 Name() const; };
$mixin Counted { $int32 counter; $dep int32 twice = { twice = counter * 2; }; $cache int32 plus(int32 n) const { return counter + n; } };
$class+ Cat isa INamed : model { string8 hue; } mixin [ Counted ] { public: vesk::string8 Name() const { return "cat"; } };
$enum+ class Refined { One = 1, default Two = 20 };
$variant+ Value { *float64; int32; string8; *{ string8 s; } big; *int32 num; void nothing; };
}
