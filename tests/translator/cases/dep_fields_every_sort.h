@import "Vesk/vxObject/IObject.h"
$struct+ S
{//
$dep ^ int32 c = 1;
$dep void d = { go();
done(); };
$indep int32* w create { } destroy { } evictable { return false; } evict { } visit { _v << $$::shared; };
$dep string8 a calc { a = name(); } create { make(a); } destroy { }
visit { _v << $$::shared; } evictable { return $this->free(); }
evict { $new X(1); $other; } invalidate
{
    stale();
}
;
$dep - bool e = true;
$indep string8 f;
int end;
};
