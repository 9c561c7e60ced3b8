// Types that offer next to nothing, in registered containers; signatures that name types without their name space.
@import "Vesk/vxObject/IObject.h"
@import "kinds/models.h"

$warning(disable: 1009)

namespace kinds {

$struct+ Bare <<copy>> { $int32 a; };
$struct Equal { int32 a; bool operator==(Equal const& rhs) const { return a == rhs.a; } };
$struct Less { int32 a; bool operator<(Less const& rhs) const { return a < rhs.a; } };
$struct Printed {
    int32 a;
    friend vesk::xostream& operator<<(vesk::xostream& os, Printed const& x) { return os << x.a; }
};
$struct Archived {
    int32 a;
    void Serialise(vesk::Archive& ar) const { ar << a; }
    void Deserialise(vesk::InputArchive& ar) { ar >> a; }
};

$type+ xvector<Bare>;
$type+ xvector<xvector<Bare>>;
$type+ xlist<Bare>;
$type+ xdeque<Bare>;
$type+ xset<Bare>;
$type+ xbag<Bare>;
$type+ xmap<Bare,int32>;
$type+ xmap<int32,Bare>;
$type+ DynArray<xmap<string8,DynArray<Bare>>>;
$type+ xvector<xvector<Equal>>;
$type+ xmap<int32,Equal>;
$type+ xvector<Less>;
$type+ xmap<Less,int32>;
$type+ xvector<Printed>;
$type+ xmap<int32,Printed>;
$type+ xvector<Archived>;
$type+ xset<Archived>;

$class+ Signatures isa vesk::IObject {
public:
    $string8 Join(xvector<string8> const& a, xlist<xstring> const& b, xdeque<string16> const& c) const {
        return vxMakeString(a << b << c);
    }
    $xmap<string8,int32> Count(xset<int32> const& a, xbag<int32> const& b, DynArray<int8> const& c) const {
        return {{"set", int32(a.size())}, {"bag", int32(b.size())}, {"array", int32(c.size())}};
    }
    $ptr<vesk::IObject> Pass(ptr<vesk::IObject> a, pref<IDoc> b, cref<Size> c, openvariant<int32> const& d) {
        return b || c || d ? ptr<vesk::IObject>() : a;
    }
};

}
