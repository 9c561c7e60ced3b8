// Models whose fields are given parts of themselves, and that hold models of another project.
@import "Vesk/vxObject/IObject.h"
@import "kinds/models.h"
@import "shapes/shapes.h"

$warning(disable: 1009)

// With operations and without.
$class+ Owns isa kinds::IDoc : model {
    xvector<string8> words;
    string8 text;
    xset<string8> names;
    xmap<string8,assignable<string8>> map;
    assignable<xvector<string8>> all;
}
{
};
$struct OwnsPlain : model {
    xvector<string8> words; string8 text; xset<string8> names; xmap<string8,assignable<string8>> map;
}
{
};

// Of this project, whose release is 1; a Size is of `kinds`, whose release is 3.
$class+ Holder isa kinds::IDoc : model { kinds::Size size; int32 behind; }
{
};
$class+ Refers isa kinds::IDoc : model kinds::Size {
};

// An object that refuses most of what it is asked for.
$class+ Stubborn isa shapes::INamedShape {
public:
    vesk::string8 Name() const { throw std::runtime_error("name"); }
    float64 Area() const { throw std::runtime_error("area"); }
    float64 Ratio() const { return 1; }
    void Scale(float64) {}
    int32 Getsize() const { return m_size; }
    void Setsize(int32 size) {
        if (size < 0) throw std::invalid_argument("size");
        m_size = size;
    }
    vesk::string8 Getlabel() const { throw std::runtime_error("label"); }
    shapes::Colour Getcolour() const { return shapes::Red; }
    void Setcolour(shapes::Colour) {}
    vesk::ptr<shapes::INamed> Getnamed() const { return {}; }
    void Setnamed(vesk::ptr<shapes::INamed>) { throw std::runtime_error("named"); }

private:
    int32 m_size = 0;
};
