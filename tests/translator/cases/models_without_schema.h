@import "Vesk/vxObject/IObject.h"
$model Point
{
    string8 name;
};
