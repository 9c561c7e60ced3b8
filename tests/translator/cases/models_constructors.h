@import "Vesk/vxObject/IObject.h"
$enum E { e1 }; $model M { E kind; bool* flag; offsettable<uint8> n; pref<vesk::IObject> v;
    explicit $$(bool* f)  : flag(f) { n = 1; }
    $$(int a, int b) { }
    $schema { 4: +flag +kind +n +v }
};
