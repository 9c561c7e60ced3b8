// Records and what is known by them alone; containers offer what their items offer; signatures need no name space.
@import "rows/rows.h"
@import "check/src/own.h"
@import "kinds/kinds.h"
@import "kinds/graph.h"
@import "kinds/remote.h"
@import "kinds/bare.h"
@import "Vesk/vxObject/Access.h"

using vesk::Find;

vesk::xstring FieldsOf(vesk::ConstStringZ name) {
    vesk::ReflectedClass const& record = *Find<vesk::ReflectedClass>(name);
    return vesk::TextOf([&](vesk::xostream& os) {
        for (vesk::ssize_t i = 0; i < record.m_numFields; ++i) {
            vesk::ReflectedField const& field = record.m_fields[i];
            os << vesk::TypeText({field.m_type, record.m_strings}) << ' ' << field.m_name << ';';
        }
    });
}

ROW(Reflection) {
    shapes::Point point;
    point.x = 3;
    point.y = 4;
    vesk::ReflectedClass const& record = *Find<vesk::ReflectedClass>("shapes::Point");
    CHECK(vesk::DecodeMetadata({record.m_metadata, record.m_strings}), "[note(\"a point\"),[1,2.5,true],plain]");
    CHECK(FieldsOf("shapes::Point"), "int32 x;[\"unit\",7] int32 y;");
    CHECK(record.m_size, sizeof(point));
    CHECK(*reinterpret_cast<int32*>(reinterpret_cast<char*>(&point) + record.m_fields[1].m_offset), 4);
    typedef int32 (*SumFn)(shapes::Point const*, int32);
    auto const& sum = record.m_methods[0];
    CHECK(vxMakeString(sum.m_name << reinterpret_cast<SumFn>(sum.m_function)(&point, 5)), "Sum12");
    CHECK(sum.m_isConst && !record.m_methods[1].m_isConst, true);
    CHECK(vesk::TargetOf(record)->m_name, "shapes");

    // Values known only by their record.
    shapes::Point copy[2];
    record.m_ops.m_copyConstruct(copy, 1, &point, 0, 1);
    CHECK(record.m_ops.m_equal == nullptr && record.m_ops.m_print == nullptr, true);
    CHECK(copy[1], "3/4");
    vesk::ReflectedClass const& box = *Find<vesk::ReflectedClass>("shapes::Box");
    const vesk::ptr<vesk::IObject> object = box.m_create();
    CHECK(object->GetReflectedClass() == &box && !vesk::QueryInterface<kinds::IDoc>(object), true);
    CHECK(vxMakeString(vesk::QueryInterface<shapes::INamed>(object)->Name() << box.m_numBaseInterfaces), "box3");
    object->DestroyObject();

    vesk::ReflectedEnum const& colour = *Find<vesk::ReflectedEnum>("shapes::Colour");
    CHECK(vxMakeString(colour.m_numLabels << colour.m_labels[2] << colour.m_values[2] << colour.m_enabled[2]), "3Blue6false");
    CHECK(vxMakeString(shapes::Refined() << shapes::Refined(8).Label() << shapes::Refined::IsEnabled(3)), "BDfalse");
    CHECK(shapes::Level(shapes::Level::High) == shapes::Level::High, true);

    vesk::ReflectedInterface const& shape = *Find<vesk::ReflectedInterface>("shapes::IShape");
    CHECK(vxMakeString(shape.m_numInheritedMethods << shape.m_attributes[1].m_name), "6label");
    CHECK(vesk::TypeText({shape.m_attributes[1].m_type, shape.m_strings}), "[\"read only\"] string8 const");
    CHECK(vesk::TypeText({shape.m_methods[1].m_args[0].m_type, shape.m_strings}), "[\"factor\"] float64");
    CHECK(vesk::DecodeMetadata({shape.m_methods[1].m_metadata, shape.m_strings}), "[1]");

    vesk::ReflectedVariant const& value = *Find<vesk::ReflectedVariant>("kinds::Value");
    CHECK(vxMakeString(value.m_numItems << vesk::TypeText({value.m_items[1].m_type, value.m_strings})), "11[\"text\"] string8");
    CHECK(Find<vesk::ReflectedFunctor>("kinds::Callback")->m_numArgs, 2);
    typedef int32 (*ThriceFn)(int32);
    CHECK(reinterpret_cast<ThriceFn>(Find<vesk::ReflectedGlobalFunction>("kinds::Thrice")->m_function)(4), 12);
    vesk::ReflectedGlobalVariable const& count = *Find<vesk::ReflectedGlobalVariable>("kinds::g_count");
    CHECK(*static_cast<int32 const*>(count.m_address), 8);
    CHECK(kinds::GetTypedefName_Known(), "kinds::Known");

    // Types: of `$type`, through typedefs, and those of the library.
    vesk::ReflectedTypedef const& numbers = *Find<vesk::ReflectedTypedef>("kinds::Numbers");
    CHECK(vesk::TypeText({numbers.m_type, numbers.m_strings}), "xvector<int32>");
    vesk::ReflectedType type;
    type.m_code = vesk::RC_VECTOR;
    type.m_inner.resize(1);
    type.m_inner[0].m_code = vesk::RC_STRING8;
    const vesk::xvector<vesk::string8> words = {"a", "b"};
    CHECK(vesk::TextOf([&](vesk::xostream& os) { vesk::PrintValue(os, type, &words); }), "[a,b]");
    type.m_code = vesk::RC_LIST;
    CHECK(vesk::FindTypeOps(type) == nullptr, true);

    static_assert(vesk::TypeTraits<shapes::Box>::kind == vesk::TTK_class && vesk::InterfaceTypeTraits<kinds::ICalc>::is_rmi, "");
    static_assert(vesk::ImplementsInterface<shapes::Box, vesk::IObject> && !vesk::ImplementsInterface<shapes::Box, kinds::IDoc>, "");
    static_assert(vesk::IsSuperInterface<vesk::IObject, shapes::INamedShape>, "");
    CHECK(vesk::RegisterReflectedClass(&record, nullptr) == vesk::NSE_OK, true);
    vesk::ReflectedClass other = record;
    other.m_size += 1;
    CHECK(vesk::RegisterReflectedClass(&other, nullptr) == vesk::NSE_ALREADY_DEFINED, true);
}

ROW(Kinds) {
    using kinds::Value;
    const vesk::xvector<Value> values = {
        Value(), Value(vesk::string8("text")), Value::ratio(2.5), Value::point(1, 2), Value::list({1, 2}),
        kinds::Size(3), Value::numbers({4, 5}), Value::name("n"), Value::level(shapes::Level::High)};
    CHECK(values, "[7,text,ratio(2.5),point(1,2),list([1,2]),Size(3,3,Red,Mid),numbers([4,5]),name(n),level(High)]");
    CHECK(values[4].as<Value::list>().items[1], 2);
    CHECK(values[4].is<Value::list>() && !values[4].is<Value::point>(), true);
    CHECK(Copied(values) == values, true);
    CHECK(vxMakeString(kinds::Nothing() << kinds::Tree::node({kinds::Tree::leaf(1), kinds::Tree()})), "voidnode([leaf(1),void])");

    CHECK(kinds::Describe(kinds::Small(1), 3, kinds::Small(vesk::string8("s"))), 13);
    vesk::ObjectHeap& heap = vesk::ObjectHeap::Get();
    CHECK(vxMakeString(kinds::Local(6) << heap.Count() << heap.Collect({})), "611");

    kinds::Stack* stack = kinds::MakeStack();
    Push(stack, 2);
    Push(stack, 3);
    CHECK(Depth(stack), 5);
    Drop(stack);

    shapes::Point point;
    point.x = 5;
    $makefunctor kinds::Callback plus { return a + int32(b.size()); }
    $makefunctor kinds::Callback bound(&point, shapes::Point) { return a + x; }
    $makeconstfunctor kinds::Callback constant(&point, shapes::Point) { return a - x; }
    CHECK(vxMakeString(plus(1, "ab") << bound(1, "") << constant(7, "")), "362");
    kinds::Callback none;
    CHECK(bound == plus || none, false);
    none = bound;
    CHECK(none(2, ""), 7);
    none = vesk::null;
    CHECK(none == kinds::Callback(), true);

    kinds::Mixed mixed;
    mixed.counter = 0;
    mixed.own = 2;
    mixed.value = 9;
    mixed.Both(3);
    mixed.inlist = 4;
    CHECK(vxMakeString(mixed.counter << mixed.anonymous << mixed.value << mixed.foreign << mixed.inlist << mixed.Getown()), "139842");
    CHECK(vxMakeString((mixed.Me() == &mixed) << mixed.Sum() << FieldsOf("kinds::Mixed")), "true42int32 own;");
    kinds::Delegates delegates;
    delegates.m_named = &mixed;
    CHECK(delegates.Name(), "mixed");
    kinds::TemplateObject<int32> object;
    CHECK(vesk::ptr<shapes::INamed>(&object)->Name(), "template");
}

namespace {

// What the registered type makes of a value and its copy: equal, less, text, and what comes back of an archive.
template <typename T>
vesk::xstring OffersOf(T const& value) {
    alignas(T) char memory[sizeof(T)];
    T& copy = *reinterpret_cast<T*>(memory);
    vesk::TypeOps const& ops = vesk::GetTypeOps<T>();
    ops.m_copyConstruct(&copy, 0, &value, 0, 1);
    const vesk::xstring offers = vesk::TextOf([&](vesk::xostream& os) {
        os << (ops.m_equal(&value, &copy) ? "equal " : "") << (ops.m_less(&copy, &copy) ? "less " : "");
        ops.m_print(os, &value);
        try {
            vesk::Archive ar;
            ops.m_serialise(ar, &value, 0, 1);
            vesk::InputArchive input(ar);
            T read;
            ops.m_deserialise(input, &read, 0, 1);
            os << ' ' << read.size();
        } catch (vesk::ArchiveError const& error) {
            os << ' ' << error.what();
        }
    });
    ops.m_destruct(&copy, 0, 1);
    return offers;
}

}

ROW(BareTypes) {
    using namespace kinds;
    const Bare bare = {};
    typedef vesk::xvector<Bare> Bares;
    for (vesk::xstring const& offers :
         {OffersOf(Bares{bare, bare}), OffersOf(vesk::xvector<Bares>{{bare}}), OffersOf(vesk::xlist<Bare>{bare}),
          OffersOf(vesk::xdeque<Bare>{bare}), OffersOf(vesk::xset<Bare>()), OffersOf(vesk::xmap<int32, Bare>{{1, bare}})}) {
        CHECK(offers, "? type cannot be archived");
    }
    CHECK(OffersOf(vesk::xvector<vesk::xvector<Equal>>{{{1}}}), "equal ? type cannot be archived");
    CHECK(OffersOf(vesk::xmap<int32, Equal>{{1, {2}}}), "equal ? type cannot be archived");
    CHECK(OffersOf(vesk::xvector<Printed>{{1}, {2}}), "[1,2] type cannot be archived");
    CHECK(OffersOf(vesk::xmap<int32, Printed>{{1, {2}}}), "[(1,2)] type cannot be archived");
    CHECK(OffersOf(vesk::xvector<Archived>{{1}, {2}}), "? 2");

    // The order of items without equality.
    const vesk::xvector<Less> one = {{1}, {2}}, two = {{1}, {3}};
    vesk::TypeOps const& vectors = vesk::GetTypeOps<vesk::xvector<Less>>();
    CHECK(vectors.m_less(&one, &two) && !vectors.m_less(&two, &one) && !vectors.m_less(&one, &one), true);
    const vesk::xmap<Less, int32> low = {{{1}, 2}}, high = {{{1}, 3}};
    vesk::TypeOps const& maps = vesk::GetTypeOps<vesk::xmap<Less, int32>>();
    CHECK(maps.m_less(&low, &high) && !maps.m_less(&high, &low), true);
    CHECK(vectors.m_lowerBound(&one, 0, 1, &two), 1);

    // A set that cannot be filled.
    vesk::InputArchive input(vesk::xvector<vesk::octet_t>{1, 0, 0, 0, 0});
    vesk::xset<Archived> set;
    CHECK(Throws([&] { vesk::GetTypeOps<vesk::xset<Archived>>().m_deserialise(input, &set, 0, 1); }), true);
}

ROW(Signatures) {
    kinds::Signatures object;
    typedef vesk::string8 Join(vesk::xvector<vesk::string8> const&, vesk::xlist<vesk::xstring> const&,
                               vesk::xdeque<vesk::string16> const&);
    CHECK(vesk::CallMethod<Join>(object, "Join", vesk::xvector<vesk::string8>{"a"}, vesk::xlist<vesk::xstring>{"b"},
                                 vesk::xdeque<vesk::string16>{u"c"}),
          "[a][b][c]");
    vesk::ReflectedClass const& record = *vesk::Find<vesk::ReflectedClass>("kinds::Signatures");
    CHECK(vesk::FindMethod(record, "Pass")->m_numArgs, 4);
    CHECK(object.Count({1, 2}, {3, 3, 3}, {4}), "[(array,1),(bag,3),(set,2)]");
    CHECK(object.Pass(&object, nullptr, nullptr, {}) == vesk::ptr<vesk::IObject>(&object), true);
}
