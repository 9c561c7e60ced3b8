// One of each kind of value that a page shows and changes.

@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace shop
{

$enum+ Size { Small, Medium = 5, Large, -Gone };
$variant+ Wrap { void; float64 paper; string8 box; };

$model+ Spot
{
    int32 x : [ range(-10, 10) ];
    int32 y;
};

$interface+ IItem : vesk::IPersistable { };

$class+ Item isa IItem : model
{
    assignable<string8> label;
    float64 price : [ unit("EUR"), range(0, 1000), help("without tax") ];
    int32 color : [ color(0) ];
    Size size;
    pref<IItem> next;
    $schema { 1: + label + price 2: + color + size + next }
}
{
};

$class+ Shop isa vesk::IObject
{
public:
    $bool isOpen;
    $int8 tiny;
    $uint64 huge;
    $int128 vast;
    $float32 half;
    $float64 whole : [ range(-1, 1) ];
    $char8 letter;
    $string8 name;
    $string16 wide;
    $Size size;
    $Wrap wrap;
    $openvariant<int32> anything;
    $xvector<int32> numbers : [ range(0, 100) ];
    $xvector<bool> bits;
    $xlist<string8> names;
    $xdeque<int32> queue;
    $int32 fixed[3];
    $xset<int32> set;
    $xmap<string8,int32> stock;
    $xmap<int32,string8> aisles;
    $xvector<Spot> spots;
    $xvector<pref<IItem>> items;
    $xvector<float64> many;

    $indep float64 rate create { rate = 2; };
    $dep float64 twice = { twice = 2 * rate; };
    $dep string8 report = { report = vxMakeString("<script>alert(" << twice << ")</script>"); };

    $int8 AddTiny(int8 a, int8 b) const { return static_cast<int8>(a + b); }
    $float64 Mix(int32 a, float32 b, float64 c, bool negate) const { return (negate ? -1 : 1) * (a + b + c); }
    $string8 Join(string8 const& a, vesk::string8 b) const { return a + "-" + b; }
    $xvector<int32> Repeat(xvector<int32> const& what, int32 times) const
    {
        vesk::xvector<int32> all;
        for (int32 i = 0; i < times; ++i) all.insert(all.end(), what.begin(), what.end());
        return all;
    }
    $void Ask(string8& text) const { text = "asked " + text; }
    $Size Next(Size s) const { return s == Small ? Medium : Large; }
    $string8 const& Name() const { return name; }
    $float32 Half(float32 f) const { return f / 2; }
    $uint64 Big(uint64 n) { huge = n; return huge; }
    $void Fail() { throw std::runtime_error("it fails"); }
    $void Break() { throw 5; }
    $void Place(Spot spot) { spots.push_back(spot); }
};

}
