// Dependency nodes with every section, in classes and mixins.
@import "Vesk/vxObject/IObject.h"
@import "kinds/models.h"
@import "kinds/cached.h"

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

    EveryCachedFunction(int32)

    $evict { ++evicted; }
    $visit { v << seen; }
    static int32 Hundred() { return 100; }
    mutable int32 evicted = 0, invalidated = 0, effects = 0;
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
$class+ WithNodes isa vesk::IObject : mixin [ NodeMixin { $dep int32 more = { more = 4; }; } ] { };

$class+ Watched isa vesk::IObject : model { int32 a; Size size; xset<int32> set; }
{
public:
    $dep int32 area = { ++calculated; area = size.width * size.height + a; };
    mutable int32 calculated = 0;
};

}
