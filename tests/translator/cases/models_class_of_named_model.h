@import "Vesk/vxObject/IObject.h"
$model M { xset<int32> s; $$() { s.Insert(7); } };
$class+ K : model M
{
    int more;
};
