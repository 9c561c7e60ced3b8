// Nodes that are evicted, written, destroyed and broken while others depend on them; many of them.
@import "Vesk/vxObject/IObject.h"
@import "kinds/models.h"

$warning(disable: 1009)

$struct Sums {
    $indep int32 x;
    $dep int32 a = { a = x; };
    $dep int32 b = { b = a + 100; };
    $cache int32 tens() const { return x / 10; }
    $cache int32 plus(int32 n) const { return x + n; }
    $dep int32 ofCaches = { ofCaches = tens() + plus(1) + 100; };
};

$struct Pair : model { int32 first; int32 second; } { };
$struct Writes {
    $indep int32 x;
    $dep int32 counted = { ++calculated; counted = x; if (isWriting) const_cast<Writes*>(this)->x = counted + 1; };
    $dep int32 behind = { behind = counted * 10; };
    // Its own value, a variable of its own, and what it makes in passing are no inputs.
    $dep Pair built =
    {
        ++calculated;
        built.first = x;
        built.first.write() += built.first;
        Pair local;
        for (int i = 0; i < 3; ++i) local.first = local.first + 1;
        built.second = local.first;
    };
    $dep int32 passing = { ++calculated; Sums sums; sums.x = x; passing = sums.b; };
    bool isWriting = false;
    mutable int32 calculated = 0;
};

$struct Breaks {
    $indep int32 x;
    $dep int32 broken =
    {
        ++calculated;
        broken = 7;
        if (x < 0) throw std::runtime_error("negative");
        broken = x;
    };
    $dep int32 behind = { behind = broken + 1; };
    $dep int32 careful = { try { careful = behind; } catch (std::runtime_error const&) { careful = -1; } };
    $dep int32 careless = { try { careless = behind; } catch (...) { careless = -1; } };
    mutable int32 calculated = 0;
};

$struct Chained {
    Chained* previous = nullptr;
    bool isCareless = false;
    $indep int32 x;
    $dep int32 depth =
    {
        ++calculated;
        depth = x;
        if (isCareless) {
            try { depth += previous->depth; } catch (...) {}
        } else if (previous) {
            depth += previous->depth;
        }
    };
    mutable int32 calculated = 0;
};

$struct+ Field <<-genop>> isa vesk::IObject : model { int32 a; int32 cells[]; xmap<int32,int32> map; kinds::Size size; } { };
$struct Plain : model { int32 a; int32 cells[]; xmap<int32,xmap<int32,int32>> maps; } { };
$struct Around : model { Plain inner; int32 other; } { };
$struct+ Operated isa vesk::IObject : model { xmap<int32,int32> map; xmap<string8,int32> words; kinds::Size size; } { };

$struct Watcher {
    Field* field = nullptr;
    Plain* plain = nullptr;
    Around* around = nullptr;
    Operated* operated = nullptr;
    int32 cells = 0;
    $dep int32 ofField =
    {
        ++calculated;
        ofField = field->a;
        for (int i = 0; i < cells; ++i) ofField += field->cells[i];
    };
    $dep int32 ofMap = { ++calculated; ofMap = int32(field->map.read().size()); };
    $dep int32 ofElement = { ++calculated; ofElement = plain->maps[1][2]; };
    $dep int32 ofAround = { ++calculated; ofAround = int32(around->inner.read().maps.read().size()); };
    $dep int32 ofOperated =
    {
        ++calculated;
        ofOperated = 0;
        for (int i = 0; i < cells; ++i) ofOperated += operated->map[i];
    };
    $dep int32 ofWords = { ++calculated; ofWords = operated->words["a"] + operated->size.read().width; };
    mutable int32 calculated = 0;
};

// Types of a user whose names are also words of the graph.
namespace words {
$struct Link {
    int32 n = 0;
    bool operator==(Link const& rhs) const { return n == rhs.n; }
    bool operator!=(Link const& rhs) const { return n != rhs.n; }
};
typedef Link Calculation, Run, Mark, Drop, Leave, Links, Changes, Place, State, Queue, Source, Of, At;
$struct Nodes {
    $indep Link link;
    $indep Leave leave;
    $indep Of of;
    $dep Mark mark = { mark.n = link.read().n + leave.read().n; };
    $dep Changes changes = { changes = mark; };
    $dep Drop drop = { drop = changes; };
    $cache Calculation calculation() const { return drop; }
    $cache Run run(int32 n) const { return Run{n + of.read().n}; }
    $cache <<async>> State state() const { return State{7}; }
    $cache <<async>> Queue queue(int32 n) const with Source in = { in = link; }; { return Queue{n + in.n}; }
};
}

// Objects that refer to each other; how many there are.
$class+ Linked isa kinds::IDoc : model { pref<kinds::IDoc> next; int32 number; cref<kinds::Size> size; }
{
public:
    Linked() { ++s_count; }
    Linked(Linked const& rhs) : BaseClass(rhs) { ++s_count; }
    ~Linked() {
        --s_count;
        if (ownsNext && next.read()) next.read()->DestroyObject();
    }
    static inline int32 s_count = 0;
    static inline bool ownsNext = false;
};
$class+ Unlike isa kinds::IDoc : model { int32 number; }
{
public:
    static inline bool s_wasMade = false;
    Unlike() { s_wasMade = true; }
};
$class+ Kept isa vesk::IObject {
public:
    Kept* other = nullptr;
    Kept* owned = nullptr;
    static inline int32 s_count = 0;
    Kept() { ++s_count; }
    ~Kept() {
        --s_count;
        if (owned) owned->DestroyObject();
    }
    $visit { v << other; }
};
$function Kept* MakeKept();
