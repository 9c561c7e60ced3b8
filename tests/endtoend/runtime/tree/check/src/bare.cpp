// Containers offer what their items offer; signatures need no name space.
@import "rows/rows.h"
@import "Vesk/vxObject/Access.h"
@import "kinds/bare.h"

using namespace kinds;

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
    const Bare bare = {};
    typedef vesk::xvector<Bare> Bares;
    CHECK(OffersOf(Bares{bare, bare}), "? type cannot be archived");
    CHECK(OffersOf(vesk::xvector<Bares>{{bare}}), "? type cannot be archived");
    CHECK(OffersOf(vesk::xlist<Bare>{bare}), "? type cannot be archived");
    CHECK(OffersOf(vesk::xdeque<Bare>{bare}), "? type cannot be archived");
    CHECK(OffersOf(vesk::xset<Bare>()), "? type cannot be archived");
    CHECK(OffersOf(vesk::xmap<int32, Bare>{{1, bare}}), "? type cannot be archived");
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
    Signatures object;
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
