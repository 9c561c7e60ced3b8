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

$class+ Thing isa IThing {
public:
    vesk::string8 Getname() const { return name; }
    void Setname(const vesk::string8& v) { name = v; }
    vesk::string8 Gettitle() const { return "title of " + name; }
    vesk::DynArray<vesk::int32> Getnumbers() const { return numbers; }
    void Setnumbers(vesk::DynArray<vesk::int32> const& v) { numbers = v; }
    vesk::Array<vesk::int32, 3> Getfixed() const { return fixed; }
    void Setfixed(vesk::Array<vesk::int32, 3> const& v) { fixed = v; }
    vesk::int32 GetvectorSize() const { return 0; }
    void DeleteFromvector(vesk::int32, vesk::int32) {}
    void RecordExtractFromvector(vesk::int32, vesk::int32, vesk::xvector<vesk::int32>&, vesk::int32) {}
    void InsertIntovector(vesk::int32, vesk::xvector<vesk::int32>&, vesk::int32, vesk::int32) {}
    vesk::int32 GetvectorElement(vesk::int32) const { return 0; }
    void SetvectorElement(vesk::int32, vesk::int32) {}
    vesk::xmap<vesk::int32, vesk::string8> Getmap() const { return map; }
    void Setmap(vesk::xmap<vesk::int32, vesk::string8> const& v) { map = v; }
    vesk::xset<vesk::int32> Getset() const { return set; }
    void Setset(vesk::xset<vesk::int32> const& v) { set = v; }
    vesk::int32 Getsizewidth() const { return plain; }
    void Setsizewidth(vesk::int32 v) { plain = v; }
    vesk::int32 Getplain() const { return plain; }
    void Setplain(vesk::int32 v) { plain = v; }
    vesk::int32 GetreadOnly() const { return plain + 1; }
    vesk::int32 Getmoved() const { return plain; }
    void Setmoved(vesk::int32 v) { plain = v; }
    vesk::xvector<vesk::int32> Getwhole() const { return whole; }
    void Setwhole(vesk::xvector<vesk::int32> const& v) { whole = v; }
    Colour Getcolour() const { return colour; }
    void Setcolour(Colour v) { colour = v; }
private:
    vesk::string8 name;
    vesk::DynArray<vesk::int32> numbers;
    vesk::Array<vesk::int32, 3> fixed;
    vesk::xmap<vesk::int32, vesk::string8> map;
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
