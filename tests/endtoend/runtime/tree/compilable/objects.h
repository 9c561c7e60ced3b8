// Objects: their interfaces, attributes, nodes and metadata.
@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

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
