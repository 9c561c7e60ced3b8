// Models in every form: pure, in the head of a struct, in a class body, referenced, in mixins; of fields of every type;
// with a schema; with operations and without.
@import "Vesk/vxObject/IObject.h"
@import "shapes/shapes.h"

$warning(disable: 1009)

namespace kinds {

$interface+ IDoc : vesk::IPersistable { };

$model+ Size : [ "size" ] {
    int32 width;
    offsettable<int32> height;
    shapes::Colour colour;
    shapes::Level level;
    $$(int32 square) : width(square), height(square), colour(shapes::Red), level(shapes::Level::Mid) {}
    $schema { 1: + width + height  2: + colour  3: + level }
    $evolve {
        colour (width) { colour = width > 10 ? shapes::Green : shapes::Red; }
        level { level = shapes::Level::High; }
    }
};

$model+ Everything {
    bool flag;
    int8 i8; int16 i16; int64 i64; int128 i128;
    uint8 u8; uint16 u16; uint32 u32; uint64 u64;
    float32 f32; float64 f64;
    string8 s8; string16 s16;
    xvector<int32> vector;
    xvector<bool> bools;
    int32 fixed[3];
    string8 texts[2];
    int32 dynamic[];
    bool flags[];
    xvector<int32> vectors[2];
    xmap<string8,int32> map;
    xmap<int32,Size> sizes;
    xmap<int32,xmap<string8,float64>> maps;
    xset<int32> set;
    xset<string8> names;
    pref<IDoc> doc;
    movable<pref<IDoc>> movableDoc;
    xvector<movable<pref<IDoc>>> docs;
    xvector<pref<const IDoc>> plainDocs;
    assignable<xvector<int32>> assigned;
    offsettable<uint16> offset;
    Size size;
    Size grid[2][3];
    openvariant<int32> any;
    cref<Size> reference;
};

$model None { };
$model Pointers { int32* p; vesk::ptr<IDoc> doc; Size size; None* none; };
$model Characters { char8 c8; char16 c16; uint128 u128; };

// With operations: an IObject with a model.
$class+ Doc isa IDoc : model {
    assignable<string8> title;
    int32 count;
    xvector<int32> lines;
    int32 marks[4];
    int32 wide[300];
    int32 grid[2][2];
    xmap<int32,string8> notes;
    xmap<int8,uint16> bytes;
    xmap<string8,Size> sizes;
    xset<int32> tags;
    xset<movable<pref<IDoc>>> docs;
    xset<pref<IDoc>> fixedDocs;
    xvector<movable<pref<IDoc>>> list;
    Size size;
    pref<IDoc> next;
    offsettable<uint32> total;
    int32 dynamic[];
    $dropped { int32 pages; }
    $schema {
        1: + title + pages + count
        2: - pages + lines + marks + wide + grid + notes + bytes + sizes + tags + docs + fixedDocs + list + size + next
        3: + total + dynamic
    }
    $evolve {
        lines (pages) {
            if (pages < 0 || pages > 1000) throw vesk::ArchiveError("number of pages");
            lines = vesk::xvector<int32>(pages);
        }
        total (count) { total = count; }
    }
} { };

// What the first release wrote for a Doc.
$struct Doc1 : model { assignable<string8> title; int32 pages; int32 count; } { };

$struct+ NoOps <<-genop>> isa vesk::IObject : model {
    int32 a;
    int32 fixed[3];
    string8 text;
    int32 dynamic[];
    xmap<int32,int32> map;
    xset<int32> set;
    Size size;
} { };
$struct Plain : model { int32 a; float64 b; } { };
$class+ Sized isa IDoc : model Size {
public:
    $int32 Area() const { return width * height; }
};
$struct Referring : model Size { };
$struct+ Multi <<multiline>> : model { int32 a; int32 b; } { };
$struct+ Direct { $model { int32 a; string8 b; } };
$struct Operations isa vesk::IObject : model <<genop>> { int32 a; } { };

}
