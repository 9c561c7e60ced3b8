// Objects, containers, archives, JSON and variants: what fails leaves no object behind, no reference to one that is gone,
// and the old value where it is replaced as a whole.
@import "memory.h"
@import "Vesk/vxObject/Json.h"

#include <cstdio>
#include <cstdlib>

$warning(disable: 1009)

vxDefineTarget(memory, 1)
void Register_Project_memory();

$class+ Kept isa vesk::IObject {
public:
    vesk::xvector<Kept*> others;
    static inline int32 s_count = 0;
    Kept() { ++s_count; }
    ~Kept() { --s_count; }
    $visit { v << others; }
};
$struct+ Listed isa vesk::IObject : model { xvector<string8> words; int32 count; } { };

$model+ Spot { int32 x; string8 label; };
$variant+ Choice { void; string8; *{ xvector<Choice> parts; } node; string8 inPlace; int32 number; };
$class+ Item isa vesk::IPersistable : model {
    string8 name;
    pref<vesk::IPersistable> next;
    cref<Spot> spot;
    xvector<string8> words;
    xmap<string8,int32> map;
    xset<int32> set;
    string8 array[];
    Choice choice;
    openvariant<int32> any;
}
{
public:
    static inline int32 s_count = 0;
    Item() { ++s_count; }
    Item(Item const& rhs) : BaseClass(rhs) { ++s_count; }
    ~Item() { --s_count; }
};

namespace {

Scenario g_scenario;
int g_position;
int g_failures;

Kept* Make() { return $new Kept(); }

void Heap(Faults& faults) {
    vesk::ObjectHeap& heap = vesk::ObjectHeap::Get();
    Kept* const root = Make();
    for (int i = 0; i < 3; ++i) root->others.push_back(Make());
    Make();
    faults.Try([&] {
        root->others.pop_back();
        heap.Collect({vesk::ptr<vesk::IObject>(root)});
    });
    faults.Expect(Kept::s_count >= 3, "what is reached is kept");
    // A collection that was given up remembers none of them.
    while (!root->others.empty()) {
        root->others.back()->DestroyObject();
        root->others.pop_back();
    }
    heap.Collect({});
    faults.Expect(Kept::s_count == 0 && heap.Count() == 0, "all objects are collected");
}

void DynamicArrays(Faults& faults) {
    const vesk::string8 text(40, 'x');
    vesk::DynArray<vesk::string8> array = {text, text};
    faults.Try([&] {
        vesk::DynArray<vesk::string8> copy = array;
        array.resize(5);
        array[4] = text;
        copy = array;
    });
    faults.Expect(array.size() >= 2 && array[0] == text && array[1] == text, "items are kept");
}

void ModelVectors(Faults& faults) {
    Listed listed;
    listed.words.push_back(vesk::string8(40, 'a'));
    int changes = 0;
    faults.Try([&] {
        vesk::ModelHook hook([&](vesk::ModelChange const&) { ++changes; });
        listed.words.push_back(vesk::string8(40, 'b'));
        listed.words.push_back(listed.words.read()[0]);
        listed.words.insert(0, listed.words.read()[1]);
        listed.words.erase(0);
    });
    faults.Expect(!listed.words.read().empty(), "elements are kept");
    for (vesk::string8 const& word : listed.words.read()) faults.Expect(word.size() == 40 || word.empty(), "elements are whole");
    const int seen = changes;
    listed.words.clear();
    faults.Expect(changes == seen && !vesk::ModelHook::Any(), "hooks end");
}

void Hooks(Faults& faults) {
    Listed listed;
    int changes = 0;
    vesk::ModelHook outer([&](vesk::ModelChange const&) { ++changes; });
    bool isDone = faults.Try([&] {
        vesk::ModelHook inner([&](vesk::ModelChange const& change) {
            if (change.PathText() == "count") ++changes;
        });
        listed.count = 1;
    });
    faults.Expect(isDone == (listed.count == 1), "a write that a hook refuses is not done");
    changes = 0;
    listed.count = 2;
    faults.Expect(changes == 1, "the outer hook is still there");
}


const vesk::string8 g_long(40, 'x');

Choice MakeTree() {
    const Choice inner = Choice::node({Choice(Choice::inPlace(g_long))});
    return Choice::node({Choice(g_long), inner, Choice(Choice::number(3))});
}

struct Items {
    Items() : spot(3, g_long) {
        Item::model_type& model = first.model();
        model.name = g_long;
        model.next = vesk::ptr<vesk::IPersistable>(&second);
        model.spot = &spot;
        model.words = {g_long, "short", g_long};
        model.map = {{g_long, 1}, {"short", 2}};
        model.set = {1, 2, 3};
        model.array = {g_long, g_long};
        model.choice = MakeTree();
        model.any = Spot(4, g_long);
        second.model().spot = &spot;
    }
    vesk::ptr<vesk::IPersistable> First() { return &first; }
    Spot spot;
    Item first, second;
};

// What was read: the first leads to the second, both to the spot.
void Destroy(vesk::ptr<vesk::IPersistable> const& read) {
    Item* const first = static_cast<Item*>(read.Object());
    delete first->spot.read().Get();
    first->next.read().Get()->DestroyObject();
    first->DestroyObject();
}

void Archives(Faults& faults) {
    Items items;
    vesk::xvector<vesk::octet_t> bytes;
    faults.Try([&] { bytes = vesk::WriteObject(items.First()); });
    const vesk::xvector<vesk::octet_t> whole = vesk::WriteObject(items.First());
    faults.Expect(bytes.empty() || bytes == whole, "an archive is whole");
    vesk::ptr<vesk::IPersistable> read;
    if (faults.Try([&] { read = vesk::ReadObject<vesk::IPersistable>(whole); })) Destroy(read);
    faults.Expect(Item::s_count == 2, "no object is left");
}

void Json(Faults& faults) {
    Items items;
    vesk::xstring text;
    faults.Try([&] { text = vesk::ObjectToJson(items.First(), {2}); });
    const vesk::xstring whole = vesk::ObjectToJson(items.First(), {2});
    faults.Expect(text.empty() || text == whole, "a text is whole");
    vesk::ptr<vesk::IPersistable> read;
    if (faults.Try([&] { read = vesk::ObjectFromJson<vesk::IPersistable>(whole); })) Destroy(read);
    faults.Expect(Item::s_count == 2, "no object is left");

    // A value that is changed field by field.
    const vesk::xstring value = vesk::ToJsonText(items.first);
    Item changed;
    if (faults.Try([&] { vesk::FromJsonText(changed, value); })) {
        changed.next.read().Get()->DestroyObject();
        delete changed.spot.read().Get();
    } else {
        faults.Expect(!changed.next.read() && !changed.spot.read(), "no reference to what is gone");
    }
    faults.Expect(Item::s_count == 3, "no object is left in a value");
}

void Values(Faults& faults) {
    Items items;
    const vesk::Value value = vesk::Value::Of(items.first);
    faults.Try([&] {
        vesk::Value::Of(items.first).Find("map[short]").Set(int32(5));
        value.Find("words[2]").Set(vesk::string8(50, 'y'));
        DumpText(value);
    });
    const vesk::xstring word = value.Find("words[2]").Text();
    faults.Expect(word == g_long || word == vesk::string8(50, 'y'), "a value is old or new");
}

void Variants(Faults& faults) {
    const Choice tree = MakeTree();
    vesk::Archive ar;
    ar << tree << tree;
    const Choice before(Choice::inPlace(vesk::string8(50, 'b')));
    Choice choice = before;
    faults.Try([&] { choice = tree; });
    faults.Expect(choice == tree || choice == before, "a variant is old or new");
    choice = before;
    faults.Try([&] {
        vesk::InputArchive input(ar);
        input >> choice;
    });
    faults.Expect(choice == tree || choice == before, "a variant that is read is old or new");
    choice = tree;
    faults.Try([&] { choice = choice.as<Choice::node>().parts[1]; });
    faults.Expect(choice == tree || choice == tree.as<Choice::node>().parts[1], "a variant is old or a part");
    vesk::xvector<Choice> many = {tree, before};
    faults.Try([&] {
        for (int i = 0; i < 5; ++i) many.push_back(many[0]);
        many.insert(many.begin(), many.data() + 1, many.data() + 3);
        many = many[0].is<Choice::node>() ? many[0].as<Choice::node>().parts : many[2].as<Choice::node>().parts;
    });
    for (Choice const& one : many) faults.Expect(one.GetTag() >= 0, "a vector's elements have values");
}

void OpenVariants(Faults& faults) {
    const vesk::openvariant<int32> before = g_long;
    vesk::openvariant<int32> any = before;
    vesk::Archive ar;
    ar << vesk::openvariant<int32>(Spot(4, g_long));
    faults.Try([&] { any = vesk::openvariant<int32>(Spot(5, g_long)); });
    faults.Expect(any == before || any.as<Spot>().x == 5, "an openvariant is old or new");
    any = before;
    faults.Try([&] {
        vesk::InputArchive input(ar);
        input >> any;
    });
    faults.Expect(any == before || any.as<Spot>().x == 4, "an openvariant that is read is old or new");
}

const vesk::xvector<Scenario> kScenarios = {
    {"heap", Heap},           {"dynamic arrays", DynamicArrays}, {"model vectors", ModelVectors}, {"hooks", Hooks},
    {"archives", Archives},   {"json", Json},                    {"values", Values},              {"variants", Variants},
    {"openvariants", OpenVariants},
};

}

bool Faults::Strike() {
    Faults* faults = s_active;
    if (!faults || --faults->m_left > 0) return false;
    if (faults->m_left < 0 && faults->m_which == One) return false;
    faults->m_hasFailed = true;
    return true;
}

void Faults::Expect(bool holds, const char* what) {
    if (holds) return;
    ++g_failures;
    std::printf("%s, allocation %d%s: not so: %s\n", g_scenario.name, g_position, m_which == One ? "" : " and all behind",
                what);
}

void* operator new(std::size_t size) {
    void* const memory = Faults::Strike() ? nullptr : std::malloc(size);
    if (!memory) throw std::bad_alloc();
    return memory;
}
void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t) noexcept { std::free(memory); }

// A scenario that ends neither way within that many allocations is at fault.
const int kMost = 5000;

int main() {
    Register_Project_memory();
    int scenarios = 0;
    int runs = 0;
    for (auto const& list : {GraphScenarios(), kScenarios}) {
        for (Scenario const& scenario : list) {
            ++scenarios;
            g_scenario = scenario;
            for (Faults::EWhich which : {Faults::One, Faults::AllBehind}) {
                bool hasFailed = true;
                for (g_position = 1; hasFailed && g_position < kMost; ++g_position, ++runs) {
                    Faults faults(g_position, which);
                    scenario.run(faults);
                    hasFailed = faults.HasFailed();
                }
                if (hasFailed) {
                    ++g_failures;
                    std::printf("%s: no end\n", scenario.name);
                }
            }
        }
    }
    std::printf("%d scenarios, %d runs, %d failures\n", scenarios, runs, g_failures);
    return g_failures > 0;
}
