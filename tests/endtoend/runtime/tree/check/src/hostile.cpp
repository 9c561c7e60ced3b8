// Archives that nobody wrote: they are refused with an ArchiveError, and leave values that can be used and destroyed.
@import "rows/rows.h"
@import "kinds/models.h"
@import "kinds/kinds.h"

using namespace kinds;

namespace {

template <typename T>
bool Refuses(Bytes bytes, T& value, vesk::ArchiveLimits const& limits = {}) {
    return ErrorOf<vesk::ArchiveError>([&] {
        vesk::InputArchive input(std::move(bytes), limits);
        input >> value;
    }) != "none";
}

template <typename T>
bool Refuses(Bytes bytes) {
    T value = T();
    return Refuses(std::move(bytes), value);
}

// What asks for more elements than there are bytes, by billions.
const Bytes g_billions = {0xF0, 0xFF, 0xFF, 0xFF, 0xFF};

struct Words {
    void Serialise(vesk::Archive& ar) const { ar << pointer << length; }
    void Deserialise(vesk::InputArchive& ar) { ar >> pointer >> length; }
    vesk::uint64 pointer = 0x1000, length = 16, more[2] = {};
};
struct OfTwo {
    template <typename A>
    void Serialise(A& ar) const { ar << first << second; }
    void Deserialise(vesk::InputArchive& ar) { ar >> first >> second; }
    vesk::cref<Words> first;
    vesk::cref<vesk::string8> second;
};

}

ROW(HostileReferences) {
    Words words;
    vesk::InputArchive input(Joined(Written(vesk::cref<Words>(&words)), {1}));
    OfTwo two;
    CHECK(Throws([&] { input >> two; }) && two.second.Get() == nullptr, true);
    delete two.first.Get();

    // A Doc, then its number where a reference to a Size or to an object of another interface stands.
    Doc doc;
    Sized sized;
    Bytes bytes = Written(vesk::pref<IDoc>(&doc));
    const std::size_t end = bytes.size();
    bytes.push_back(1);
    auto second = [&](auto reference) {
        vesk::InputArchive input(bytes);
        vesk::pref<IDoc> first;
        input >> first;
        CHECK(input.m_position, end);
        const bool throws = Throws([&] { input >> reference; });
        first->DestroyObject();
        return throws;
    };
    CHECK(second(vesk::pref<IDoc>()) || second(vesk::cref<Doc>()), false);
    CHECK(second(vesk::cref<Size>()) && second(vesk::cref<Sized>()) && second(vesk::pref<shapes::INamed>()), true);

    // The other way round: a value behind a cref is no object.
    Size size(3);
    vesk::InputArchive fromValue(Joined(Written(vesk::cref<Size>(&size)), {1}));
    vesk::cref<Size> held;
    vesk::pref<IDoc> object;
    CHECK(Throws([&] { fromValue >> held >> object; }), true);
    delete held.Get();
}

ROW(HostileTypes) {
    // Any name with any bytes behind it is either read or refused.
    vesk::xvector<vesk::xstring> names = {"", "int32", "bool", "no::such", "kinds::IDoc", "shapes::Colour"};
    for (vesk::ReflectedClass const* record : vesk::All<vesk::ReflectedClass>()) names.push_back(record->m_name);
    for (vesk::ReflectedVariant const* record : vesk::All<vesk::ReflectedVariant>()) names.push_back(record->m_name);
    for (auto const& [name, ops] : vesk::TypeOpsTable()) names.push_back(name);
    int held = 0;
    for (vesk::xstring const& name : names) {
        Bytes bytes = Written(name);
        bytes.insert(bytes.end(), 64, 0);
        vesk::openvariant<int32> any = vesk::string8("before");
        const bool isRefused = Refuses(bytes, any);
        const vesk::openvariant<int32> copy = any;
        vxMakeString(copy << (copy == any) << (copy < any));
        if (isRefused) CHECK(any.as<vesk::string8>(), "before");
        held += !isRefused;
    }
    CHECK(held > 20 && held < int(names.size()), true);

    // What a program does not want is not made: by class, by the name of the type.
    vesk::openvariant<int32> any;
    auto refuses = [&any](auto const& value, auto allow, auto allowType) {
        vesk::InputArchive ar(Written(vesk::openvariant<int32>(value)));
        ar.m_objects.m_allow = allow;
        ar.m_objects.m_allowType = allowType;
        return Throws([&] { ar >> any; });
    };
    auto noClass = [](vesk::ReflectedClass const&) { return false; };
    auto noSize = [](vesk::xstring const& type) { return type != "kinds::Size"; };
    CHECK(refuses(Size(3), noClass, nullptr) && refuses(Size(3), nullptr, noSize), true);
    CHECK(refuses(int32(3), noClass, noSize) || any.as<int32>() != 3, false);
    CHECK(refuses(Size(3), nullptr, nullptr) || any.as<Size>().width != 3, false);
}

template <typename V>
void TryVariant(V const& written) {
    const Bytes bytes = Written(written);
    for (std::size_t size = 0; size < bytes.size(); ++size) {
        V read = vesk::string8("a text that is long enough to stand on the heap");
        CHECK(Refuses(Bytes(bytes.begin(), bytes.begin() + size), read), true);
        if (size == 0) CHECK(read.template is<vesk::string8>(), true);
        vxMakeString(read);
        read = written;
        CHECK(read == written, true);
    }
    vesk::Archive ar;
    vesk::SerialiseVariableLengthUint(ar, 70000u);
    V read = vesk::string8("text");
    CHECK(vxMakeString(Refuses(ar.m_bytes, read) << read), "truetext");
}

ROW(HostileVariants) {
    for (Value const& value : {Value(Value::point(1, 2)), Value(Value::list({1, 2, 3})), Value(Size(3))}) TryVariant(value);
    TryVariant<Small>(vesk::string8("some text"));
    CHECK(Refuses<Nothing>({2}) && !Refuses<Nothing>({1}), true);

    // The member on its own: what it destroyed is not destroyed again.
    Value value = vesk::string8("a text that is long enough to stand on the heap");
    CHECK(Throws([&] { vesk::InputArchive none; value.Deserialise(none); }), true);

    Bytes deep;
    for (int i = 0; i < 100000; ++i) deep.insert(deep.end(), {1, 1});
    deep.push_back(0);
    CHECK(Refuses<Tree>(deep), true);

    // As deep as it may be it is compared in no time, also as a key.
    deep.clear();
    for (int i = 0; i < 200; ++i) deep.insert(deep.end(), {1, 1});
    deep.push_back(0);
    Tree tree;
    CHECK(Refuses(deep, tree), false);
    const Tree copy = tree;
    CHECK(copy == tree && !(copy < tree), true);
    Bytes keys = {2};
    for (int leaf : {0, 2}) {
        keys.insert(keys.end(), deep.begin(), deep.end() - 1);
        keys.push_back(vesk::octet_t(leaf));
        if (leaf == 2) keys.insert(keys.end(), 4, 0);
    }
    vesk::xset<Tree> set;
    CHECK(vxMakeString(Refuses(keys, set) << set.size()), "false2");
}

ROW(HostileNumbers) {
    CHECK(Refuses<bool>({2}) && !Refuses<bool>({1}), true);
    CHECK(Refuses<vesk::xvector<bool>>({2, 1, 255}) && Refuses<vesk::DynArray<bool>>({2, 1, 255}), true);
    CHECK(Refuses<shapes::Colour>({3}) && Refuses<shapes::Level>({3}) && Refuses<shapes::Refined>({2}), true);
    for (int number : {0, 5, 6}) CHECK(Refuses<shapes::Colour>({vesk::octet_t(number)}), false);
    for (int number : {0, 1, 7, 8}) CHECK(Refuses<shapes::Refined>({vesk::octet_t(number)}), false);
    CHECK(Refuses<shapes::Empty>({0}), false);
    vesk::ArchiveLimits limits;
    limits.m_anyEnumNumber = true;
    shapes::Colour colour = shapes::Red;
    shapes::Level level;
    CHECK(Refuses({3}, colour, limits) || Refuses({3}, level, limits), false);
    CHECK(vxMakeString(colour << level), "33");
}

ROW(HostileSizes) {
    CHECK(Refuses<vesk::string8>(g_billions) && Refuses<vesk::string16>({2, 0, 0, 0}), true);
    CHECK(Refuses<vesk::xvector<None>>(g_billions) && Refuses<vesk::xlist<None>>(g_billions), true);
    CHECK(Refuses<vesk::DynArray<Everything>>(g_billions) && Refuses<vesk::DynArray<int32>>({2, 0, 0, 0, 0, 0, 0, 0}), true);
    CHECK((Refuses<vesk::xmap<int32, int32>>(g_billions) && Refuses<vesk::xset<vesk::string8>>(g_billions)), true);
    CHECK((Refuses<vesk::Array<int32, 3>>({2, 0, 0, 0, 0, 0, 0, 0, 0})), true);

    Everything all;
    all.vector = {1, 2};
    all.dynamic = {3};
    all.texts[1] = "text";
    all.sizes[1].width = 2;
    all.any = vesk::string8("any");
    const Bytes bytes = Written(all);
    int refused = 0;
    for (std::size_t size = 0; size < bytes.size(); ++size) {
        Everything read;
        refused += Refuses(Bytes(bytes.begin(), bytes.begin() + size), read);
    }
    CHECK(refused, bytes.size());
}

ROW(Limits) {
    vesk::ArchiveLimits limits;
    limits.m_bytes = 8;
    limits.m_depth = 3;
    limits.m_objects = 1;
    limits.m_emptyElements = 2;
    vesk::xvector<None> empty;
    CHECK(Refuses({3}, empty, limits) && !Refuses({2}, empty, limits) && !Refuses({3, 0}, empty), true);
    Tree tree;
    const Bytes deep = {1, 1, 1, 1, 1, 1, 0};
    CHECK(Refuses(deep, tree, limits) && !Refuses({1, 1, 1, 1, 0}, tree, limits) && !Refuses(deep, tree), true);
    vesk::xvector<int32> numbers;
    CHECK(Refuses({2, 0, 0, 0, 0, 0, 0, 0, 0}, numbers, limits) && !Refuses({1, 0, 0, 0, 0}, numbers, limits), true);
    vesk::xvector<vesk::cref<vesk::int8>> references;
    CHECK(Refuses({2, 1, 7, 2, 8}, references, limits), true);
    delete references[0].Get();
    CHECK(Refuses({2, 1, 7, 1}, references, limits), false);
    CHECK(references[0] == references[1] && *references[0] == 7, true);
    delete references[0].Get();
}
