@import "Vesk/vxObject/IObject.h"
$variant+ V <<-compare>> : [ 7 ]
{
    default x("a");
    int32;
    string8 x;
    void none;
    *pref<vesk::IObject> ref;
    { int32 a; string8 b; } s;
    *{ pref<vesk::IObject> p; } h;
};
