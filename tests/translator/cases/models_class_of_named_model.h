@import "Vesk/vxObject/IObject.h"
$model M { xset<int32> s; };
$class+ K : model M
{
    int more;
};
