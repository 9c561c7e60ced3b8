@import "Vesk/vxObject/IObject.h"
$struct S
{//
$cache <<queue(1 + 2) visit>> inline int32 f() const
{
    return 1; 
}
$cache ^ void g(bool& b) const { }
$cache int32 h(int32 const& a) const { }
$cache <<async>> int32 i(int32 a, bool b) const with string8 in { in = $$; } { return size(in); }
$cache ^ <<queue(7)>> void k(bool& out, int32 a, string8 const& b, float64 c) const { }
int end;
};
