// Cached functions of every form, for a class, a mixin and a class template: what their nodes inherit may depend on
// parameters.
@import "Vesk/vxObject/IObject.h"
@import "shapes/shapes.h"

$warning(disable: 1009)

namespace kinds {

@def EveryCachedFunction(T) =
{
    $cache T tens() const { ++calculated; return source / 10; }
    $cache ^ <<queue(2)>> void filled(vesk::xvector<T>& out) const { out.assign(3, source); }
    $cache T plus(T a) const { ++calculated; return source + a; }
    $cache ^ T sum(T a, const vesk::string8& b, T c = 1) const { return source + a + T(b.size()) + c; }
    $cache void keyed(vesk::string8& out, int32 n) const { out = vesk::string8(n, 'x'); }
    $cache <<async>> T later() const { return source + 1; }
    $cache <<async io>> void laterInto(T& out) const with T in = { in = source; }; { out = in * 2; }
    $cache <<async queue(1)>> T laterKeyed(T k) const
        with vesk::xvector<T> in { in.push_back(source); in.push_back(k); }
    {
        return in[0] + in[1];
    }
    $cache <<async>> void laterPlain(T& out, T k, T m) const { out = k * m; }
    mutable int32 calculated = 0;
}

$mixin CacheMixin {
    $indep int32 source;
    EveryCachedFunction(int32)
};
$class+ WithCaches isa vesk::IObject : mixin [ CacheMixin ] { public: $int32 base; };

$struct CacheTemplate<typename T> {
    $indep T source;
    EveryCachedFunction(T)
};

}
