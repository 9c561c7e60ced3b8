// What stands in classes, in templates and in mixins.
@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace nested_kinds {

$class+ Outer isa vesk::IObject {
public:
    $functor int32 Callback(int32 a, const string8& b);
    $functor void Action();
    $variant Value {
        default int32(2);
        int32; string8; float64 ratio; void nothing; { int32 x; int32 y; } point; *{ string8 a; xvector<int32> b; } boxed; *string8 far;
        cref<Outer> other; { } none;
    };
    $variant Shown { default 3; int32; xvector<int32>; };
    $variant State { void on; void off; };
    Value value;
    State state = State::off();
};
$struct Holder {
    $struct Deep {
        $variant Choice { void; int32; };
        $functor int32 Pick(int32 a);
        Choice choice;
        Pick pick;
    };
    Deep deep;
};
template <typename T>
struct Plain {
    T value;
};
$class Box<typename T> {
public:
    $variant Held { void; int32; string8 text; };
    $functor void Changed(int32 a);
    Held held;
    Changed changed;
    T value;
};

}

namespace nested_models {

$model Base { int32 shared; };
$mixin Counts { $int32 counter; };

$class+ Outer isa vesk::IObject {
public:
    $struct Size : model { int32 width; string8 name; } { };
    $class Part : model { xvector<int32> items; } { };
    $struct Deep {
        $struct Inner : model { int32 a; } { };
        Inner inner;
    };
    $struct Old : model { int32 a; int32 b; $schema { 1: +a 2: +b } $evolve { b { b = 7; } } } { };
    $struct Body { $model { int32 inBody; string8 text; } };
    $struct Referring : model Base { };
    $struct Listing : mixin [ Counts model { int32 listed; } ] { $int32 Twice() const { return 2 * counter; } };
    $struct Several : Deep model { int32 a; xmap<int32,string8> map; } { };
    $struct Printed <<os ar>> {
        int32 x = 0;
        void Write(vesk::xostream& os) const { os << "x=" << x; }
        template <typename Archive> void Serialise(Archive& ar) const { ar << x; }
        void Deserialise(vesk::InputArchive& ar) { ar >> x; }
    };
    $class Persistable isa vesk::IPersistable : model { int32 kept; } { };
    $struct Generic<typename T> : model { int32 count; } { T item; };
    Size size;
private:
    $struct Hidden : model { int32 a; } { };
    Hidden hidden;
};
$struct InTemplate<typename T> {
    $struct Inner : model { int32 a; } { T item; };
};
}

namespace mixin_visits {

$interface+ IDoc : vesk::IPersistable { };
$mixin Visits { vesk::ptr<vesk::IObject> m_seen; $visit { v << m_seen; } };
$mixin Body { $model { int32 a; xmap<int32,string8> map; xset<int32> set; pref<IDoc> doc; xvector<pref<IDoc>> docs; } };
$mixin Small { $model { int32 small; } };
$class+ Uses isa vesk::IObject : mixin [ Visits ] { };
$class+ Holds isa IDoc : mixin [ Body ] { };
$class+ Lists isa vesk::IObject : mixin [ Small ] { };
$struct+ Plain : mixin [ Small ] { };

}

namespace templates {

$model Base { int32 shared; };
struct Plain { int32 plain = 1; };
template <typename T> struct PlainOf { T plain = T(); };
$struct Box<typename T> : model { int32 count; string8 name; } { T item; };
$struct Archived<typename T> <<ar os>> : model { string8 item; }
{
    void Write(vesk::xostream& os) const { os << "item " << this->model().item; }
};
$struct Referring<typename T> : model Base { T extra; };
$class Kept<typename T> isa vesk::IPersistable : model { int32 item; } { };
$struct Printed<typename K, typename V> : model { xmap<int32,string8> map; } { };
$struct Body<typename T> { $model { int32 a; string8 text; } };
$struct Derived<typename T> : Plain, PlainOf<T> model { int32 a; } { };
$struct Old<typename T> : model {
    int32 a;
    int32 b;
    $schema { 1: +a 2: +b }
    $evolve { b(a) { b = a + 1; } }
} { };
$mixin Adds<typename T> : PlainOf<T> model { int32 added; } { };
$struct Lists<typename T> : mixin [ Adds<T> ] { };
$struct Concrete : mixin [ Adds<int32> ] { };

}

namespace template_methods {

$mixin Counts {
    $int32 counter;
    $int32 Count(int32 by) { counter += by; return counter; }
    $void Reset() { counter = 0; }
};
$mixin Typed<typename T> {
    $int32 Size(int32 by) const { return by * int32(sizeof(T)); }
};
$mixin Shown <<reflect>> {
    $int32 shown;
    $int32 Twice() const { return 2 * shown; }
};
$class+ Uses isa vesk::IObject : mixin [ Counts Typed<int32> Shown ] { };
$struct Cell<typename T> {
    T item;
    $int32 n;
    $int32 Get(int32 by) const { return n * by; }
    $void Set(int32 value) { n = value; }
};
$struct+ Registered<typename T> { T item; $int32 n; $int32 Get() const { return n; } };
$struct Reflected<typename T> <<reflect>> { $int32 n; };

}

namespace template_mixin_fields {

$mixin Fields { $int32 a; $string8 name; $indep int32 node; };
$struct Holds<typename T> : mixin [ Fields ] { T value; };
$struct Reflects<typename T> <<reflect>> : mixin [ Fields ] { $int32 value; };
$class Object<typename T> isa vesk::IObject : mixin [ Fields ] { };

}
