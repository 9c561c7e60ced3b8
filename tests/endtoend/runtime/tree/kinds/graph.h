// Dependency nodes with every section, in classes and mixins; cached functions, plain and keyed, sync and async.
@import "Vesk/vxObject/IObject.h"
@import "kinds/models.h"

$warning(disable: 1009)

namespace kinds {

$class+ Cell isa shapes::INamed : model { int32 input; string8 text; int32 items[]; }
{
public:
    vesk::string8 Name() const { return "cell"; }

    $indep int32 source;
    $indep vesk::string8 label
        create { label = "start"; }
        destroy { (void)label; }
        visit { _v << seen; }
        evictable { return false; }
        evict { };
    $dep int32 twice = { twice = source * 2 + int32(input); };
    $dep ^ int32 hard = { hard = source / 10; };
    $dep vesk::xvector<int32> list calc { list.clear(); for (int i = 0; i < source; ++i) list.push_back(i); };
    $dep <<-visit>> int32* pointer calc { pointer = nullptr; };
    $dep int32 sections
        calc { ++calculated; sections = tens() + $$::Hundred(); }
        create { sections = 0; }
        destroy { (void)sections; }
        visit { _v << seen; }
        evictable { return true; }
        evict { ++evicted; }
        invalidate { ++invalidated; };
    $dep void effect calc { ++effects; (void)source.read(); };
    $dep - int32 unreflected = { unreflected = source; };
    $dep int32 cyclic = { cyclic = backAgain + 1; };
    $dep int32 backAgain = { backAgain = cyclic + 1; };
    $dep int32 total = { total = 0; for (int i = 0; i < items.read().size(); ++i) total += items[i]; };

    $cache int32 tens() const { ++calculated; return source / 10; }
    $cache ^ <<queue(2)>> void filled(vesk::xvector<int32>& out) const { out.assign(3, source); }
    $cache int32 plus(int32 a) const { ++calculated; return source + a; }
    $cache int32 sum(int32 a, const vesk::string8& b, int32 c = 1) const { return source + a + int32(b.size()) + c; }
    $cache void keyed(vesk::string8& out, int32 n) const { out = vesk::string8(n, 'x'); }
    $cache <<async>> int32 later() const { return source + 1; }
    $cache <<async io>> void laterInto(int32& out) const with int32 in = { in = source; }; { out = in * 2; }
    $cache <<async queue(1)>> int32 laterKeyed(int32 k) const
        with vesk::xvector<int32> in { in.push_back(source); in.push_back(k); }
    {
        return in[0] + in[1];
    }
    $cache <<async>> void laterPlain(int32& out, int32 k, int32 m) const { out = k * m; }

    $evict { ++evicted; }
    $visit { v << seen; }
    static int32 Hundred() { return 100; }
    mutable int32 evicted = 0, calculated = 0, invalidated = 0, effects = 0;
    vesk::ptr<shapes::INamed> seen;
};

$struct Nodes {
    $indep int32 a;
    $dep int32 b = { b = a + 1; };
    $cache int32 c() const { return b + 1; }
    $evict { }
};

$mixin NodeMixin {
    $indep int32 base;
    $dep int32 derived = { derived = base + 1; };
    $dep void action calc { };
    typename BC::FinalClass const* Final() const { return $this; }
};
$class+ WithNodes isa shapes::INamed : mixin [ NodeMixin { $dep int32 more = { more = 4; }; } ] {
public:
    vesk::string8 Name() const { return "nodes"; }
};

$class+ Watched isa vesk::IObject : model { int32 a; Size size; xset<int32> set; }
{
public:
    $dep int32 area = { ++calculated; area = size.width * size.height + a; };
    mutable int32 calculated = 0;
};

}
