@import "Vesk/vxObject/IObject.h"
$struct S
{//
$indep int* w create { } destroy { } evictable { return false; } evict { } visit { _v << $$::shared; };
int end;
};
