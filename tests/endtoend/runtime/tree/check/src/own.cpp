// Values that are given parts of themselves, and what fails in the middle; the releases of an archive's projects;
// classes that nobody registered.
@import "rows/rows.h"
@import "check/src/own.h"
@import "kinds/kinds.h"
@import "Vesk/vxObject/Json.h"

namespace vesk {
XTarget* kinds_GetXTarget();
XTarget* check_GetXTarget();
}

using namespace kinds;

namespace {

// Longer than what a string holds within itself.
vesk::string8 Word(int n) { return vxMakeString("a word with the number " << n); }

template <typename M>
void CheckOwnFields() {
    M own;
    vesk::xvector<vesk::string8> words;
    for (int i = 0; i < 3; ++i) {
        own.words.push_back(Word(i));
        words.push_back(Word(i));
    }
    for (int i = 0; i < 100; ++i) {
        // At full capacity and below, at the end and ahead of it.
        own.words.push_back(own.words.read()[i % 3]);
        words.push_back(vesk::string8(words[i % 3]));
        own.words.insert(1, own.words.read()[2]);
        words.insert(words.begin() + 1, vesk::string8(words[2]));
        if (i > 4) continue;
        own.words.insert(2, own.words.read().data() + 1, 3);
        const vesk::xvector<vesk::string8> range(words.begin() + 1, words.begin() + 4);
        words.insert(words.begin() + 2, range.begin(), range.end());
        own.words.push_front(own.words.read().back());
        words.insert(words.begin(), vesk::string8(words.back()));
    }
    CHECK(own.words.read(), words);
    own.words.insert(0, own.words.read().data(), 0);
    CHECK(own.words.read().size(), words.size());

    for (int i = 0; i < 6; ++i) {
        if (i == 0) own.text.insert(0, Word(7).data(), 5);
        own.text.insert(i, own.text.read().data() + 1, vesk::ssize_t(own.text.read().size()) - 2);
        own.text.push_back(own.text.read()[2]);
    }
    vesk::string8 text = Word(7).substr(0, 5);
    for (int i = 0; i < 6; ++i) {
        text.insert(i, std::string(text, 1, text.size() - 2));
        text.push_back(text[2]);
    }
    CHECK(own.text.read(), text);

    own.names.Insert(Word(1));
    CHECK(!own.names.Insert(*own.names.read().begin()) && own.names.Delete(*own.names.read().begin()), true);
    own.map["a"] = Word(1);
    own.map["b"] = own.map.read()["a"];
    CHECK(own.map.read()["b"], Word(1));
}

// A hook takes away what a write is about to use.
template <typename M>
void CheckErasingHooks() {
    M own;
    auto refused = [&own](auto write) {
        own.words.model() = {Word(1), Word(2)};
        own.text.model() = Word(3);
        vesk::ModelHook hook([&own](vesk::ModelChange const&) {
            own.words.model().clear();
            own.text.model().clear();
        });
        try {
            write();
        } catch (std::out_of_range const&) {
            return own.words.model().empty() && own.text.model().empty();
        }
        return false;
    };
    const vesk::string8 text = "inserted";
    CHECK(refused([&] { own.text.push_back('x'); }), true);
    CHECK(refused([&] { own.text.insert(5, text.data(), 8); }), true);
    CHECK(refused([&] { own.text.erase(5); }), true);
    CHECK(refused([&] { own.words.push_back(text); }), true);
    CHECK(refused([&] { own.words.insert(1, &text, 1); }), true);
    CHECK(refused([&] { own.words.pop_back(); }), true);
}

Tree Leaf(int n) { return Tree(int32(n)); }
Tree Node(vesk::xvector<Tree> branches) { return Tree(Tree::node(branches)); }

struct Branch {
    int32 number;
    vesk::xlist<Branch> list;
    vesk::xmap<int32, Branch> map;
    friend vesk::xostream& operator<<(vesk::xostream& os, Branch const& b) { return os << b.number << b.list << b.map; }
};

// Assigns a container a part of itself.
template <typename C>
void CheckOwnParts(C container, C const& (*partOf)(C const&)) {
    const vesk::xstring part = vxMakeString(partOf(container));
    container = partOf(container);
    CHECK(container, part);
}

struct Counted {
    Counted() { Make(); }
    Counted(Counted const&) { Make(); }
    ~Counted() { --s_count; }
    static void Make() {
        if (s_count == 3) throw std::bad_alloc();
        ++s_count;
    }
    static inline int s_count = 0;
};

}

ROW(OwnParts) {
    CheckOwnFields<Owns>();
    CheckOwnFields<OwnsPlain>();
    CheckErasingHooks<Owns>();
    CheckErasingHooks<OwnsPlain>();
    Owns own;
    own.all = vesk::xvector<vesk::string8>{Word(1), Word(2)};
    own.all = own.all.read();
    CHECK(own.all.read()[1], Word(2));

    const Tree tree = Node({Node({Leaf(1), Leaf(2)}), Leaf(3), Leaf(4)});
    CheckOwnParts<vesk::xvector<Tree>>({tree, tree, tree}, [](auto const& c) -> auto const& {
        return c[0].template as<Tree::node>().branches;
    });
    const Branch branch = {1, {{2, {{3, {}, {}}}, {}}, {4, {}, {}}}, {{5, {6, {}, {{7, {8, {}, {}}}}}}, {9, {}}}};
    CheckOwnParts<vesk::xlist<Branch>>({branch, branch}, [](auto const& c) -> auto const& { return c.front().list; });
    CheckOwnParts<vesk::xmap<int32, Branch>>({{0, branch}}, [](auto const& c) -> auto const& { return c[0].map; });
    vesk::DynArray<Tree> array = {tree, Leaf(1)};
    vesk::DynArray<Tree> const& same = array;
    array = same;
    CHECK(array[0] == tree, true);

    CHECK(Throws([&] { array.resize(-1); }) && Throws([] { vesk::DynArray<int32> none(-1); }), true);
    CHECK(array.size(), 2);
    // Half an array leaves nothing behind.
    alignas(Counted) char room[8 * sizeof(Counted)];
    Counted* const made = reinterpret_cast<Counted*>(room);
    CHECK(Throws([&] { vesk::ConstructArray(made, 0, 8); }) && Counted::s_count == 0, true);
    vesk::ConstructArray(made, 0, 2);
    CHECK(Throws([&] { vesk::CopyConstructArray(made, 2, made, 0, 2); }) && Counted::s_count == 2, true);
    vesk::DestructArray(made, 0, 2);
}

namespace {

// An archive of WriteObject in the given releases of the two projects.
Bytes HolderBytes(int kindsRelease, Bytes const& size) {
    const Bytes projects = {0xFF, 'v', 'x', 2, 2, 5, 'c', 'h', 'e', 'c', 'k', 1, 5, 'k', 'i', 'n', 'd', 's', vesk::octet_t(kindsRelease)};
    return Joined(projects, Bytes{0, 2, 6, 'H', 'o', 'l', 'd', 'e', 'r', 1}, size, Bytes{8, 0, 0, 0});
}

vesk::xstring ReadHolder(Bytes const& bytes) {
    vesk::xstring text;
    const vesk::xstring error = ErrorOf([&] {
        const vesk::ptr<IDoc> read = vesk::ReadObject<IDoc>(bytes);
        text = vxMakeString(*static_cast<Holder*>(read.Object()));
        read->DestroyObject();
    });
    return error == "none" ? text : error;
}

}

ROW(Projects) {
    Holder holder;
    holder.size.model() = Size(20);
    holder.behind = 8;
    // Named are those whose models occur, then the others.
    const Bytes bytes = vesk::WriteObject(vesk::ptr<IDoc>(&holder));
    Bytes expected = HolderBytes(3, {20, 0, 0, 0, 20, 0, 0, 0, 0, 1});
    const Bytes others = {1, 6, 's', 'h', 'a', 'p', 'e', 's', 1};
    expected[19] = 1;
    expected.insert(expected.begin() + 20, others.begin() + 1, others.end());
    CHECK(bytes, expected);
    CHECK(ReadHolder(bytes), "Holder(Size(20,20,Red,Mid),8)");

    // Another program wrote `kinds` in an older release, or in a later one.
    CHECK(ReadHolder(HolderBytes(1, {20, 0, 0, 0, 7, 0, 0, 0})), "Holder(Size(20,7,Green,High),8)");
    CHECK(ReadHolder(HolderBytes(2, {20, 0, 0, 0, 7, 0, 0, 0, 0})), "Holder(Size(20,7,Red,High),8)");
    const vesk::xstring later = "archive of release 4 of kinds, this is release 3";
    CHECK(ReadHolder(HolderBytes(4, {20, 0, 0, 0, 7, 0, 0, 0, 0, 1})), later);
    Bytes unknown = HolderBytes(3, {20, 0, 0, 0, 7, 0, 0, 0, 0, 1});
    unknown[14] = 'x';
    CHECK(ReadHolder(unknown), "archive of a project that is not defined here: kxnds");
    // A later one that does not occur, as far as the writer saw, is refused when its model is met.
    Bytes unseen = HolderBytes(4, {20, 0, 0, 0, 7, 0, 0, 0, 0, 1});
    unseen[4] = 1;
    unseen.insert(unseen.begin() + 12, 1);
    unseen.erase(unseen.begin() + 20);
    CHECK(ReadHolder(unseen), later);
    // One that is not named had a single release.
    Bytes unnamed = HolderBytes(1, {20, 0, 0, 0, 7, 0, 0, 0});
    unnamed[4] = 1;
    unnamed.erase(unnamed.begin() + 12, unnamed.begin() + 19);
    CHECK(ReadHolder(unnamed), "Holder(Size(20,7,Green,High),8)");

    // Archives of before: they name no project but that of a class.
    Bytes before = HolderBytes(3, {20, 0, 0, 0, 7, 0, 0, 0, 0, 1});
    before[3] = 1;
    before.erase(before.begin() + 4, before.begin() + 20);
    CHECK(ReadHolder(before), "Holder(Size(20,7,Red,Mid),8)");
    before.push_back(0);
    CHECK(ReadHolder(before), "bytes behind the object");
    for (std::size_t size = 4; size < bytes.size(); ++size) {
        const Bytes part(bytes.begin(), bytes.begin() + size);
        if (!Throws([&] { vesk::ReadObject<IDoc>(part); })) CHECK(size, "refused");
    }

    // The model that a class references.
    Refers refers;
    CHECK(vesk::WriteObject(vesk::ptr<IDoc>(&refers))[4], 2);
    const vesk::ptr<IDoc> old = vesk::ReadObject<IDoc>(
        {0xFF, 'v', 'x', 2, 1, 5, 'k', 'i', 'n', 'd', 's', 1, 0, 2, 6, 'R', 'e', 'f', 'e', 'r', 's', 1, 20, 0, 0, 0, 7, 0, 0, 0});
    CHECK(*static_cast<Refers*>(old.Object()), "Size(20,7,Green,High)");
    old->DestroyObject();

    // What nobody could read is not written.
    vesk::XTarget& kinds = *vesk::kinds_GetXTarget();
    kinds.m_rsn = 2;
    const vesk::xstring low = "vxDefineTarget(kinds, 2): the $schema of kinds::";
    Doc doc;
    CHECK(ErrorOf([&] { Written(doc); }).substr(0, low.size()), low);
    CHECK(ErrorOf([&] { vesk::WriteObject(vesk::ptr<IDoc>(&holder)); }).substr(0, low.size()), low);
    kinds.m_rsn = 3;
    CHECK(ErrorOf([&] { Written(doc); }), "none");
}

// The last of all: this project is not registered any more behind it.
void CheckForgotten() {
    vesk::UnregisterTarget(vesk::check_GetXTarget());
    Holder holder;
    const vesk::ptr<IDoc> object(&holder);
    const vesk::xstring error = "class is not registered: Holder (call Register_Project_check() first)";
    CHECK(ErrorOf([&] { vesk::ToJsonText(holder); }), error);
    CHECK(ErrorOf([&] { vesk::FromJsonText(holder, "null"); }), error);
    CHECK(ErrorOf([&] { vesk::ToJsonText(vesk::xvector<Holder>()); }), error);
    CHECK(ErrorOf([&] { vesk::ObjectToJson(object); }), error);
    CHECK(ErrorOf([&] { vesk::WriteObject(object); }), error);
    const vesk::xstring text = "{\"$objects\":[{\"$class\":\"Holder\"}],\"$value\":{\"$ref\":1}}";
    CHECK(ErrorOf([&] { vesk::ObjectFromJson<IDoc>(text); }), "line 1, column 14: " + error);
    CHECK(ReadHolder(HolderBytes(3, {20, 0, 0, 0, 7, 0, 0, 0, 0, 1})), error);
    CHECK(ErrorOf([&] { Written(vesk::openvariant<int32>(holder)); }),
          "type of an openvariant is not registered (call Register_Project_check() first)");
}
