// Exported from a dynamic library: interfaces with attributes, enumerations, structs with metadata, a class of two
// interfaces, a function.
@import "Vesk/vxObject/IObject.h"

namespace shapes {

$enum+ Colour : [ "colours" ] { Red, Green = 5, -Blue };
$enum+ class Level { Low, default Mid, High };
$enum+ class Refined { A, default B, C = 7, -D };
$enum+ Empty { };

$interface+ INamed : vesk::IObject {
    string8 Name() const;
};

$interface+ IShape : [ "a shape" ] : vesk::IObject {
    float64 Area() const;
    void Scale(float64 by : [ "factor" ]) : [ 1 ];
    int32 size;
    const string8 label : [ "read only" ];
    Colour colour;
    vesk::ptr<INamed> named;
};

// Both, IObject by two ways.
$interface+ INamedShape : IShape, INamed {
    float64 : [ "unit" ] Ratio() const;
};
$interface+ INothing { };

$struct+ Point : [ note("a point"), [ 1, 2.5, true ], plain ] {
    $int32 x;
    $int32 : [ "unit", 7 ] y;
    $int32 Sum(int32 more = 1) const { return x + y + more; }
    $void Move(int32 dx, int32 dy) { x += dx; y += dy; }
    bool operator==(Point const& rhs) const { return x == rhs.x && y == rhs.y; }
    bool operator<(Point const& rhs) const { return x < rhs.x; }
    friend vesk::xostream& operator<<(vesk::xostream& os, Point const& p) { return os << p.x << '/' << p.y; }
};

$class+ Square : [ "class" ] {
public:
    $float64 side;
};
$class Forward;
$class+ Box isa INamedShape {
public:
    Box() : side(1) {}
    vesk::string8 Name() const;
    float64 Area() const { return side * side; }
    float64 Ratio() const { return 1; }
    void Scale(float64 by) { side *= by; }
    int32 Getsize() const { return m_size; }
    void Setsize(int32 size) { m_size = size; }
    vesk::string8 Getlabel() const { return "label"; }
    Colour Getcolour() const { return m_colour; }
    void Setcolour(Colour colour) { m_colour = colour; }
    vesk::ptr<INamed> Getnamed() const { return m_named; }
    void Setnamed(vesk::ptr<INamed> named) { m_named = named; }
    $float64 side;

private:
    int32 m_size = 0;
    Colour m_colour = Red;
    vesk::ptr<INamed> m_named;
};

$function+ int32 Twice(int32 n = 2);

}
