@import "Vesk/vxObject/IObject.h"
$struct S
{//
$evict { $$::drop(); } $visit { v << $this; }
int end;
};
