// Fields and items of every type in models and variants.
@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace array_typedef {

$typedef int32 Triple[3];
$typedef+ string8 Pair[2];
$typedef int32 Grid[2][3];
$typedef int32 Any[];
$model Uses { Triple triple; Pair pair; int32 n; };
$struct Holds : model { Triple triple; Grid grid; Any any; } { };

}

namespace const_fields {

$typedef+ const int32 ConstInt;
$class+ Fixed isa vesk::IObject {
public:
    Fixed() : a(4), b(5), c(6), d(7), text("text") {}
    explicit Fixed(int32 value) : a(value), b(value), c(value), d(value), text("") {}
    $const int32 a;
    $int32 const b;
    $int32 c;
    $ConstInt d;
    $const string8 text;
};
$struct+ Plain { Plain() : a(1), pointer(nullptr) {} $const int32 a; $const int32* pointer; };
$mixin Mixed { Mixed() : m(7) {} $const int32 m; };
$class+ Lists isa vesk::IObject : mixin [ Mixed ] { };
$struct Holds<typename T> : mixin [ Mixed ] { Holds() : own() {} $const int32 own; };

}

namespace whole_fields {

$struct Point { int32 x; };
inline bool operator==(Point const& a, Point const& b) { return a.x == b.x; }
inline bool operator<(Point const& a, Point const& b) { return a.x < b.x; }
$model+ Part { int32 a; string8 name; int32 marks[2]; };
$class+ Doc isa vesk::IObject : model {
    int32 fixed[3];
    xvector<int32> vector;
    xmap<int32,string8> map;
    int32 grid[2][2];
    xmap<int32,Part> parts;
    Part cells[2][2];
    xvector<Part> list;
}
{
};
$struct Plain : model {
    int32 fixed[3];
    xvector<int32> vector;
    xmap<int32,string8> map;
    int32 grid[2][2];
    Part cells[2][2];
    Part part;
    offsettable<int32> sum;
    xset<int32> set;
    string8 names[2][2];
    xmap<int32,xmap<int32,string8>> deep;
}
{
};

}

namespace scalar_items {

$enum+ Colour { red, green };
enum Plain { one = 1, two };
typedef Plain Alias;
$typedef Colour Tint;
$variant Items {
    default int32(7);
    Colour; int32; vesk::float64; bool; string8; *Colour boxed; Colour named; Plain; unsigned octet; Alias alias; Tint tint;
    std::string text; xvector<Colour>; { string8 a; xvector<int32> b; } both;
};
$variant+ Shown { default 1; int32; Colour; uint8 small; };

}

namespace empty_items {

$variant Command { default stop(); { } stop; { int32 x; } go; *{ } boxed; void none; };
$variant+ Shown { default 1; int32; { } stop; };

}

// One brace for two names, around text that stands outside of them.
namespace empty_items::inner {

$class+ Head { public: $int32 x; };
$variant+ Slot { default free(); void free; int32; };

}

// Values that stay whole when making another one fails; what is not there.

namespace exceptions {

// Copying and reading one fail on demand.
struct Fragile {
    Fragile() { Fail(); }
    Fragile(int n) : text(n, 'x') {}
    Fragile(Fragile const& rhs) : text(rhs.text) { Fail(); }
    Fragile(Fragile&& rhs) noexcept : text(std::move(rhs.text)) {}
    Fragile& operator=(Fragile const& rhs) = default;
    bool operator==(Fragile const& rhs) const { return text == rhs.text; }
    bool operator<(Fragile const& rhs) const { return text < rhs.text; }
    friend vesk::xostream& operator<<(vesk::xostream& os, Fragile const& f) { return os << vesk::string8(f.text); }
    void Serialise(vesk::Archive& ar) const { ar << vesk::string8(text); }
    void Deserialise(vesk::InputArchive&) { throw vesk::ArchiveError("fragile"); }
    static void Fail() { if (s_fails) throw std::bad_alloc(); }
    static inline bool s_fails = false;
    std::string text;
};
$variant Held <<ar>> {
    default vesk::string8("nothing");
    string8;
    Fragile inPlace;
    *Fragile onHeap;
    { int32 x; string8 y; } point;
};
$variant+ Tree { void; *{ xvector<Tree> branches; } node; string8 leaf; };
$functor+ int32 Callback(int32 a);
$functor void Action();

$enum+ Colour { red, green };
$model+ Evolved {
    int32 first;
    int32 third;
    $dropped { int32 second; Colour colour; }
    $schema { 1: + first  2: + second + colour  4: - second - colour + third }
    $evolve { third (second, colour) { third = 10 * second + int(colour); } }
};
$struct Keeper : model Evolved { };

}

namespace polymorphic {

$variant Shape { default int32(0); int32; int32 side; float64; string8 name; { int32 x; int32 y; } point; *{ int32 r; } boxed; };
inline int32 Area(int32 const& side) { return side * side; }
inline int32 Area(vesk::float64 const& radius) { return int32(radius); }
inline int32 Area(vesk::string8 const& name) { return int32(name.size()); }
inline int32 Area(Shape::point const& p) { return p.x * p.y; }
inline int32 Area(Shape::boxed const& b) { return b.r + 1; }
$polymorphic+ inline int32 Area([Shape shape]);

$variant Left { int32 a; string8 b; };
template <typename A, typename B>
inline void Meet(A const&, B const&, vesk::string8& out) { out += sizeof(A) == sizeof(vesk::int32) ? "a" : "b"; out += sizeof(B) == sizeof(vesk::int32) ? "a" : "b"; }
$polymorphic inline void Meet([const Left& left], [const Left& right], string8& out);

}
