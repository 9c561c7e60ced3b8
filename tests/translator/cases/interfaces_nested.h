@import "Vesk/vxObject/IObject.h"
$class C {
    int x;
$interface I { void f(); };
$struct N : mixin [ IDelegatorMixin ] { I GetI(); };
};