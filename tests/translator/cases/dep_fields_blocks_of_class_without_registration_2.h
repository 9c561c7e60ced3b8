@import "Vesk/vxObject/IObject.h"
$mixin S
{//
$visit { v << x; }
int end;
};
