// Plain data: every `$` member is a member as any other, and known at run time as well.

@import "Vesk/vxObject/IObject.h"

namespace geo
{

$struct+ Point <<compare os ar>> : [ "in the plane" ]
{
    $float64 x : [ unit("mm") ];
    $float64 y : [ unit("mm") ];

    explicit $$(float64 a = 0, float64 b = 0) : x(a), y(b) {}
    $void Move(float64 dx, float64 dy) { x += dx; y += dy; }
    $float64 DistanceTo(const Point& other) const;

    void Write(vesk::xostream& os) const { os << '(' << x << ',' << y << ')'; }
    void Serialise(vesk::Archive& ar) const { ar << x << y; }
    void Deserialise(vesk::InputArchive& ar) { ar >> x >> y; }
    bool operator==(const $$ & p) const { return x == p.x && y == p.y; }
    bool operator<(const $$ & p) const { return x != p.x ? x < p.x : y < p.y; }
};

// A template gets a record for each of its instances.
$warning(disable: 1009)
$struct Pair<typename T, typename U> <<reflect>>
{
    T first{};
    U second{};
    $int32 uses;
};

}
