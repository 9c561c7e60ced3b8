// Reflected fields of every type outside of models: no archive, no operations of their own, no `$type`.
@import "Vesk/vxObject/IObject.h"
@import "kinds/kinds.h"

$warning(disable: 1009)

namespace kinds {

$struct+ Part <<compare>> {
    $int32 number;
    $string8 name;
    $xvector<int8> marks;
    bool operator==(Part const& rhs) const { return number == rhs.number && name == rhs.name && marks == rhs.marks; }
    bool operator<(Part const& rhs) const { return number < rhs.number; }
};
$struct+ Wide <<compare>> {
    Wide(int32 n = 0) : big(n), small(0) {}
    $int128 big;
    $int8 small;
    bool operator<(Wide const& rhs) const { return big < rhs.big; }
    bool operator==(Wide const& rhs) const { return big == rhs.big; }
};

$class+ Reflected isa vesk::IObject {
public:
    Reflected()
        : flag(false), i8(0), i16(0), i64(0), i128(0), u64(0), u128(0), f32(0), f64(0), c8('a'), c16(u'b'),
          colour(shapes::Red) {
    }
    $bool flag;
    $int8 i8;
    $int16 i16;
    $int64 i64;
    $int128 i128;
    $uint64 u64;
    $uint128 u128;
    $float32 f32;
    $float64 f64;
    $char8 c8;
    $char16 c16;
    $string8 s8;
    $string16 s16;
    $shapes::Colour colour;
    $shapes::Level level;
    $Part part;
    $xvector<Part> parts;
    $xvector<bool> bits;
    $xvector<xvector<string8>> words;
    $DynArray<Part> dynamic;
    $xlist<Part> list;
    $xlist<int8> bytes;
    $xdeque<Part> deque;
    $xdeque<int16> shorts;
    $xset<string8> names;
    $xset<Part> partSet;
    $xbag<int32> bag;
    $xbag<Wide> wides;
    $xmap<string8,Part> byName;
    $xmap<int32,xvector<xmap<string8,float64>>> deep;
    $xmap<shapes::Colour,int8> byColour;
    $xmap<int8,Wide> wideMap;
    $xmap<Part,int32> byPart;
    $xmap<float64,string8> byFloat;
    $xvector<Tree> trees;
    $vesk::openvariant<int32> any;
    $xmap<string8,vesk::pref<vesk::IObject>> objects;
    $vesk::cref<Part> shared;
    $vesk::ptr<vesk::IObject> plain;
    $Numbers typedefd;
    $int32 fixed[3];

    $int32 Add(int32 a, int32 b) const { return static_cast<int32>(int64(a) + b + i8); }
    $void Rename(vesk::string8 const& name) { s8 = name; }
};

$class+ Sources isa vesk::IObject {
public:
    $indep int8 tiny;
    $indep int32 number;
    $indep string8 text;
    $dep int32 twice = { twice = static_cast<int32>(int64(number) * 2 + tiny); };
};

}
