@import "Vesk/vxObject/IObject.h"
$struct+ A <<extern -traits>>
{
    int y;
    $int32 x; $void f(); };
