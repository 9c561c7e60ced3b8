@import "Vesk/vxObject/IObject.h"
$function int f(int a = 1, char const* b = g(2, 3));
$function inline int32 g() : [ 1 ] { if (x) { y(); } return $x$ + '}'; } // rest
$function inline C* h()
{
    $new C(1, $new D) ; return $new a::B<int>(2)->c;
}
$var int x[3] = {1,2,3};
$var DynArray<int32> a; $var xvector<int32> b[2][] = f(); $var string8 const& c = d;
namespace n { $typedef int32 T[2]; }
$var+ vesk::pref<vesk::IObject> p[3];
$typedef+ <<extern>> xmap<int32,string8> T;
