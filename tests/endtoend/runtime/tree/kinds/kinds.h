// Variants, functors, typedefs, registered types, functions, opaque types, mixins, nested things, templates.
@import "Vesk/vxObject/IObject.h"
@import "kinds/models.h"

$warning(disable: 1009)

namespace kinds {

$variant+ Value : [ "v" ] {
    default 7;
    int32;
    string8 : [ "text" ];
    float64 ratio;
    void nothing;
    { int32 x; int32 y; } point;
    *{ xvector<int32> items; } list;
    *Size;
    *Size big;
    xvector<int32> numbers;
    string8 name;
    shapes::Level level;
};
$variant+ Nothing { void; void none; };
$variant Small { int32; string8; };
$variant+ Tree { void; *{ xvector<Tree> branches; } node; int32 leaf; };

$functor+ int32 Callback(int32 a, const string8& b) : [ "f" ];
$functor void Action(int32 n = 3);

$typedef+ xvector<int32> Numbers;
typedef vesk::int32 Known;
$typedef+ <<extern>> int32 Known;
$type+ xvector<string8>;
$type+ xmap<string8,int32>;
$type+ vesk::pref<IDoc>;
$type DynArray<int32>;

template <typename A, typename B>
int32 Describe(A const&, int32 n, B const&) { return n + 10 * int32(sizeof(A) == 4) + 100 * int32(sizeof(B) == 4); }
inline void Show(vesk::int32) {}
inline void Show(vesk::string8 const&) {}
$polymorphic+ inline int32 Describe([Small a], int32 n, [Small b]);
$polymorphic inline void Show([Small a]);
$function int Local(int n);
$function+ inline int32 Thrice(int32 n) { return 3 * n; }

$adt+ Stack : [ "adt" ] {
    int32 Depth() const;
    void Push(int32 n);
    void Drop();
};
$function+ Stack* MakeStack();

$mixin Counter {
    $int32 counter;
    void Count() { ++counter; }
    typename BC::FinalClass* Me() { return $this; }
};
$mixin Args<typename T> {
    T value;
};
$mixin WithModel : model { int32 inmixin; } { };
$mixin WithBase : shapes::Point { };
struct Foreign {
    template <typename BC>
    struct M : public BC {
        int foreign = 8;
    };
};

$class+ Mixed isa shapes::INamed : mixin
[
    Counter
    Args<int32>
    WithBase
    { $int32 anonymous; void Both(int v) { anonymous = v; $this->Count(); } }
    model { int32 inlist; string8 text; }
    ? Foreign::M
] {
public:
    $implementing shapes::INamed { Name };
    $class Nested { $int32 a; };
    $struct NestedStruct { $int32 b; int32 Twice() const { return 2 * b; } };
    $enum NestedEnum { one, two };
    $interface NestedInterface { void F(); };
    $mixin NestedMixin { int32 c; };
    $int32 own;
    int32 Sum() { return $$::Static() + own; }
    static int32 Static() { return 40; }
};
$class+ ListsModel isa vesk::IObject : mixin [ Size ] { };
$class+ ListsMixin isa vesk::IObject : mixin [ WithModel ] { };
$struct Post : shapes::Point mixin [ Counter ] Multi { };
$struct RawAndModel : shapes::Point model { int32 q; } { };
$class+ Delegates isa shapes::INamed : mixin
[
    { vesk::ptr<shapes::INamed> m_named; vesk::ptr<shapes::INamed> Get() const { return m_named; } }
] {
public:
    vesk::string8 Name() const { return Get()->Name(); }
};

$struct Deferred isa shapes::INamed;
$struct Deferred isa shapes::INamed {
    vesk::string8 Name() const { return "deferred"; }
};
$class+ Final final isa vesk::IObject { };
$class+ Abstract <<abstract>> isa vesk::IObject { };
$struct Template<typename T> { T t; };
$struct TemplateObject<typename T> isa shapes::INamed {
    T t;
    vesk::string8 Name() const { return "template"; }
};
$struct TemplateModel<typename T> <<-os>> : model { int32* a; } { };
struct External {
    int32 a;
};
$struct External <<extern copy reflect>> { };

}
