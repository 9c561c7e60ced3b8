// Values that stay whole when making another one fails; what is not there.
@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace exceptions
{

// Copying and reading one fail on demand.
struct Fragile
{
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
$variant Held <<ar>>
{
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
$model+ Evolved
{
    int32 first;
    int32 third;
    $dropped { int32 second; Colour colour; }
    $schema { 1: + first  2: + second + colour  4: - second - colour + third }
    $evolve { third (second, colour) { third = 10 * second + int(colour); } }
};
$struct Keeper : model Evolved { };

}
