@import "Vesk/vxObject/IObject.h"
$class C {
$interface I { void f(); };
$struct N : mixin [ IDelegatorMixin ] { I GetI(); };
};