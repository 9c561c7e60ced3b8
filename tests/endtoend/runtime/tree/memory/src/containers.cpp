@import "memory.h"

$warning(disable: 1009)

$class+ Kept isa vesk::IObject {
public:
    vesk::xvector<Kept*> others;
    static inline int32 s_count = 0;
    Kept() { ++s_count; }
    ~Kept() { --s_count; }
    $visit { v << others; }
};
$struct+ Listed isa vesk::IObject : model { xvector<string8> words; int32 count; } { };

namespace {

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

}

vesk::xvector<Scenario> ContainerScenarios() {
    return {{"heap", Heap}, {"dynamic arrays", DynamicArrays}, {"model vectors", ModelVectors}, {"hooks", Hooks}};
}
