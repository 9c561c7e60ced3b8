@import "Vesk/vxObject/IObject.h"
$struct S
{//
$dep string8 a calc { a = name(); } create { make(a); } destroy { }
visit { _v << $$::shared; } evictable { return $this->free(); }
evict { $new X(1); $other; } invalidate
{
    stale();
}
;
int end;
};
