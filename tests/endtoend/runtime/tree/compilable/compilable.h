// What does not compile without the key: what stands in classes, in templates and in mixins; objects with their
// interfaces, attributes, nodes and metadata; fields and items of every type in models and variants.
@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace nested_kinds {

$class+ Outer isa vesk::IObject {
public:
    $functor int32 Callback(int32 a, const string8& b);
    $functor void Action();
    $variant Value {
        default int32(2);
        int32; string8; float64 ratio; void nothing; { int32 x; int32 y; } point; *{ string8 a; xvector<int32> b; } boxed; *string8 far;
        cref<Outer> other; { } none;
    };
    $variant Shown { default 3; int32; xvector<int32>; };
    $variant State { void on; void off; };
    Value value;
    State state = State::off();
};
$struct Holder {
    $struct Deep {
        $variant Choice { void; int32; };
        $functor int32 Pick(int32 a);
        Choice choice;
        Pick pick;
    };
    Deep deep;
};
template <typename T>
struct Plain {
    T value;
};
$class Box<typename T> {
public:
    $variant Held { void; int32; string8 text; };
    $functor void Changed(int32 a);
    Held held;
    Changed changed;
    T value;
};

}

namespace nested_models {

$model Base { int32 shared; };
$mixin Counts { $int32 counter; };

$class+ Outer isa vesk::IObject {
public:
    $struct Size : model { int32 width; string8 name; } { };
    $class Part : model { xvector<int32> items; } { };
    $struct Deep {
        $struct Inner : model { int32 a; } { };
        Inner inner;
    };
    $struct Old : model { int32 a; int32 b; $schema { 1: +a 2: +b } $evolve { b { b = 7; } } } { };
    $struct Body { $model { int32 inBody; string8 text; } };
    $struct Referring : model Base { };
    $struct Listing : mixin [ Counts model { int32 listed; } ] { $int32 Twice() const { return 2 * counter; } };
    $struct Several : Deep model { int32 a; xmap<int32,string8> map; } { };
    $struct Printed <<os ar>> {
        int32 x = 0;
        void Write(vesk::xostream& os) const { os << "x=" << x; }
        template <typename Archive> void Serialise(Archive& ar) const { ar << x; }
        void Deserialise(vesk::InputArchive& ar) { ar >> x; }
    };
    $class Persistable isa vesk::IPersistable : model { int32 kept; } { };
    $struct Generic<typename T> : model { int32 count; } { T item; };
    Size size;
private:
    $struct Hidden : model { int32 a; } { };
    Hidden hidden;
};
$struct InTemplate<typename T> {
    $struct Inner : model { int32 a; } { T item; };
};
}

namespace mixin_visits {

$interface+ IDoc : vesk::IPersistable { };
$mixin Visits { vesk::ptr<vesk::IObject> m_seen; $visit { v << m_seen; } };
$mixin Body { $model { int32 a; xmap<int32,string8> map; xset<int32> set; pref<IDoc> doc; xvector<pref<IDoc>> docs; } };
$mixin Small { $model { int32 small; } };
$class+ Uses isa vesk::IObject : mixin [ Visits ] { };
$class+ Holds isa IDoc : mixin [ Body ] { };
$class+ Lists isa vesk::IObject : mixin [ Small ] { };
$struct+ Plain : mixin [ Small ] { };

}

namespace templates {

$model Base { int32 shared; };
struct Plain { int32 plain = 1; };
template <typename T> struct PlainOf { T plain = T(); };
$struct Box<typename T> : model { int32 count; string8 name; } { T item; };
$struct Archived<typename T> <<ar os>> : model { string8 item; }
{
    void Write(vesk::xostream& os) const { os << "item " << this->model().item; }
};
$struct Referring<typename T> : model Base { T extra; };
$class Kept<typename T> isa vesk::IPersistable : model { int32 item; } { };
$struct Printed<typename K, typename V> : model { xmap<int32,string8> map; } { };
$struct Body<typename T> { $model { int32 a; string8 text; } };
$struct Derived<typename T> : Plain, PlainOf<T> model { int32 a; } { };
$struct Old<typename T> : model {
    int32 a;
    int32 b;
    $schema { 1: +a 2: +b }
    $evolve { b(a) { b = a + 1; } }
} { };
$mixin Adds<typename T> : PlainOf<T> model { int32 added; } { };
$struct Lists<typename T> : mixin [ Adds<T> ] { };
$struct Concrete : mixin [ Adds<int32> ] { };

}

namespace template_methods {

$mixin Counts {
    $int32 counter;
    $int32 Count(int32 by) { counter += by; return counter; }
    $void Reset() { counter = 0; }
};
$mixin Typed<typename T> {
    $int32 Size(int32 by) const { return by * int32(sizeof(T)); }
};
$mixin Shown <<reflect>> {
    $int32 shown;
    $int32 Twice() const { return 2 * shown; }
};
$class+ Uses isa vesk::IObject : mixin [ Counts Typed<int32> Shown ] { };
$struct Cell<typename T> {
    T item;
    $int32 n;
    $int32 Get(int32 by) const { return n * by; }
    $void Set(int32 value) { n = value; }
};
$struct+ Registered<typename T> { T item; $int32 n; $int32 Get() const { return n; } };
$struct Reflected<typename T> <<reflect>> { $int32 n; };

}

namespace template_mixin_fields {

$mixin Fields { $int32 a; $string8 name; $indep int32 node; };
$struct Holds<typename T> : mixin [ Fields ] { T value; };
$struct Reflects<typename T> <<reflect>> : mixin [ Fields ] { $int32 value; };
$class Object<typename T> isa vesk::IObject : mixin [ Fields ] { };

}

namespace attributes {

$model+ Size { int32 width; };
$enum+ Colour { red, green };
$interface+ IThing : vesk::IObject {
    string8 name;
    const string8 title;
    int32 numbers[];
    int32 fixed[3];
    xvector<int32> vector;
    xmap<int32,string8> map;
    xset<int32> set;
    Size size;
    int32 plain;
    const int32 readOnly;
    offsettable<int32> moved;
    assignable<xvector<int32>> whole;
    Colour colour;
};

// The functions of an attribute that a member holds.
#define ATTRIBUTE(TYPE, NAME, MEMBER) \
    TYPE Get##NAME() const { return MEMBER; } \
    void Set##NAME(TYPE const& v) { MEMBER = v; }

$class+ Thing isa IThing {
public:
    vesk::string8 Getname() const { return name; }
    void Setname(const vesk::string8& v) { name = v; }
    vesk::string8 Gettitle() const { return "title of " + name; }
    ATTRIBUTE(vesk::DynArray<vesk::int32>, numbers, numbers)
    typedef vesk::Array<vesk::int32, 3> Fixed;
    ATTRIBUTE(Fixed, fixed, fixed)
    vesk::int32 GetvectorSize() const { return 0; }
    void DeleteFromvector(vesk::int32, vesk::int32) {}
    void RecordExtractFromvector(vesk::int32, vesk::int32, vesk::xvector<vesk::int32>&, vesk::int32) {}
    void InsertIntovector(vesk::int32, vesk::xvector<vesk::int32>&, vesk::int32, vesk::int32) {}
    vesk::int32 GetvectorElement(vesk::int32) const { return 0; }
    void SetvectorElement(vesk::int32, vesk::int32) {}
    typedef vesk::xmap<vesk::int32, vesk::string8> Map;
    ATTRIBUTE(Map, map, map)
    ATTRIBUTE(vesk::xset<vesk::int32>, set, set)
    ATTRIBUTE(vesk::int32, sizewidth, plain)
    ATTRIBUTE(vesk::int32, plain, plain)
    vesk::int32 GetreadOnly() const { return plain + 1; }
    ATTRIBUTE(vesk::int32, moved, plain)
    ATTRIBUTE(vesk::xvector<vesk::int32>, whole, whole)
    ATTRIBUTE(Colour, colour, colour)
private:
    vesk::string8 name;
    vesk::DynArray<vesk::int32> numbers;
    Fixed fixed;
    Map map;
    vesk::xset<vesk::int32> set;
    vesk::xvector<vesk::int32> whole;
    vesk::int32 plain = 0;
    Colour colour = red;
};

}

namespace ipc {

$interface+ ipc ICounter : vesk::IObject {
    void Add([in] int32 n);
    void Get([in] int32 times, [out] int32& n) const;
    void Name([in] const string8& name, [inout] string8& full);
};
$interface ipc IPlain { void Ping(); };

$class+ Counter isa ICounter {
public:
    void Add(int32 n) { total += n; }
    void Get(int32 times, int32& n) const {
        if (times < 0) throw std::invalid_argument("times");
        n = times * total;
    }
    void Name(vesk::string8 const& name, vesk::string8& full) { full += name; }
    int32 total = 0;
};

}

namespace metadata {

$class+ Shows isa vesk::IObject {
public:
    $int32 a : [ "field" ];
    $int32 Add(int32 n : [ "argument" ]) const : [ "method" ] { return a + n; }
    $void Reset() : [ "reset", 1 ] { a = 0; }
};
$typedef+ xvector<int32> Numbers : [ "typedef" ];

}

namespace short_bodies {

$class+ Doubles isa vesk::IObject {
public:
    $indep int32 b;
    $dep int32 a = b + 1;
    $dep int32 twice = a * 2;
    $cache <<async>> int32 later(int32 n) const with int32 in = b + n; { return in * 2; }
};

}

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
} { };
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
} { };

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
