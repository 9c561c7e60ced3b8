// What a change of an input, an eviction, an error or a write does to what depends on it; and that long chains, many
// links and many keys are as fast for each as few, and no deeper on the stack.
@import "rows/rows.h"
@import "check/src/nodes.h"

#include <ctime>

ROW(Evictions) {
    Sums s;
    s.x = 5;
    CHECK(s.b.read(), 105);
    s.a.TryEvict(true);
    s.x = 0;
    CHECK(vxMakeString(s.b.read() << ' ' << s.ofCaches.read()), "100 101");
    s.x = 20;
    CHECK(s.ofCaches.read(), 123);
    s.EvictDgsNodes();
    s.x = 30;
    CHECK(s.ofCaches.read(), 134);

    // A dirty value is given back as well, and an assigned object is another one.
    vesk::EvictionQueue& queue = vesk::EvictionQueue::Get(0);
    s.b.read();
    const vesk::ssize_t count = queue.Count();
    s.x = 1;
    s.a.TryEvict(true);
    CHECK(queue.Count(), count - 1);
    Sums other;
    other.x = 8;
    CHECK(s.b.read(), 101);
    s = other;
    CHECK(s.b.read(), 108);
    CHECK(vxMakeString(s.b.Inputs().size() << s.b.Dependents().size() << s.a.Dependents().size()), "101");
}

ROW(WritesInside) {
    Writes w;
    w.x = 5;
    const auto state = [&w] {
        return vxMakeString(w.behind.read() << ' ' << w.counted.IsUpToDate() << ' ' << w.behind.IsUpToDate());
    };
    CHECK(state(), "50 true true");
    w.isWriting = true;
    w.x = 6;
    CHECK(state(), "60 false false");
    CHECK(vxMakeString(w.x.read() << ' ' << w.behind.read()), "7 70");
    w.isWriting = false;
    CHECK(state(), "80 true true");

    w.calculated = 0;
    for (int round = 0; round < 2; ++round) {
        CHECK(vxMakeString(w.built.read().first << ' ' << w.built.read().second << ' ' << w.passing.read()), "16 3 108");
        CHECK(w.built.IsUpToDate() && w.passing.IsUpToDate(), true);
        CHECK(vxMakeString(w.built.Inputs().size() << w.passing.Inputs().size() << w.calculated), "112");
    }
}

ROW(ErrorsInside) {
    Breaks b;
    b.x = 3;
    CHECK(b.careful.read(), 4);
    b.x = -1;
    CHECK(vxMakeString(b.careful.read() << b.careless.read()), "-1-1");
    CHECK(Throws([&] { b.behind.read(); }) && !b.behind.IsUpToDate(), true);
    // What the calculation left behind is no value: coming to it is a change.
    b.x = 7;
    CHECK(vxMakeString(b.behind.read() << b.careful.read() << b.careless.read()), "888");
    b.calculated = 0;
    b.x = -2;
    CHECK(vxMakeString(b.careful.read() << b.calculated), "-11");
}

ROW(Fields) {
    Field field, otherField;
    Plain plain;
    Around around;
    Operated operated;
    Watcher w;
    w.field = &field;
    w.plain = &plain;
    w.around = &around;
    w.operated = &operated;
    auto read = [&w] {
        w.ofField.read();
        w.ofMap.read();
        w.ofElement.read();
        w.ofAround.read();
        w.ofWords.read();
    };
    // Which of the five a change makes dirty.
    auto dirty = [&](auto change) {
        read();
        change();
        vesk::xstring bits;
        for (bool isUpToDate : {w.ofField.IsUpToDate(), w.ofMap.IsUpToDate(), w.ofElement.IsUpToDate(),
                                w.ofAround.IsUpToDate(), w.ofWords.IsUpToDate()}) {
            bits += isUpToDate ? '0' : '1';
        }
        return bits;
    };
    plain.maps[1][2] = 3;
    operated.words["a"] = 1;
    CHECK(dirty([&] { field.a = 1; }), "10000");
    CHECK(dirty([&] { otherField.a = 1; otherField.map[1] = 2; }), "00000");
    CHECK(dirty([&] { field.map[1] = 2; }), "01000");
    CHECK(dirty([&] { field.size.width = 2; }), "00000");
    // Without an object, elements of the same field are not told apart by what they belong to.
    CHECK(dirty([&] { plain.maps[1][2] = 4; }), "00110");
    CHECK(dirty([&] { plain.write(); }), "00100");
    CHECK(dirty([&] { around.write(); }), "00010");
    CHECK(dirty([&] { operated.words["a"] = 2; }), "00001");
    CHECK(dirty([&] { operated.words["ab"] = 2; }), "00000");
    CHECK(dirty([&] { operated.size.width = 2; }), "00001");
    CHECK(dirty([&] { operated.EvictDgsNodes(); }), "00001");
}

ROW(WordsOfTheGraph) {
    words::Nodes nodes;
    nodes.link = {1};
    nodes.leave = {2};
    CHECK(nodes.calculation().n + nodes.run(3).n + nodes.state().n + nodes.queue(4).n, 6);
    vesk::RunAsyncCalculations();
    CHECK(nodes.state().n + nodes.queue(4).n, 12);
}

namespace {

// Whether an action takes the processor time of a linear one. (What is quadratic takes minutes.)
template <typename Action>
bool IsQuick(Action action) {
    const std::clock_t begin = std::clock();
    action();
    return std::clock() - begin < 6 * CLOCKS_PER_SEC;
}

vesk::xvector<Chained> Chain(int length) {
    vesk::xvector<Chained> chain(length);
    for (int i = 1; i < length; ++i) chain[i].previous = &chain[i - 1];
    for (Chained& link : chain) link.x = 1;
    return chain;
}

}

ROW(Chains) {
    const int length = 60000;
    vesk::xvector<Chained> chain = Chain(length);
    CHECK(IsQuick([&] { CHECK(chain.back().depth.read(), length); }), true);
    CHECK(chain[0].calculated + chain[length / 2].calculated < 6, true);
    chain[0].x = 2;
    CHECK(chain.back().depth.IsUpToDate(), false);
    CHECK(IsQuick([&] { CHECK(chain.back().depth.read(), length + 1); }), true);
    chain.back().depth.TryEvict(true);
    CHECK(chain.back().depth.read(), length + 1);
    // A calculation that catches everything catches no unwinding.
    for (Chained& link : chain) link.depth.TryEvict(true);
    for (int i = 1; i < length; ++i) chain[i].isCareless = true;
    CHECK(chain.back().depth.read(), length + 1);
    // A circle of that length is found.
    for (Chained& link : chain) {
        link.depth.TryEvict(true);
        link.isCareless = false;
    }
    chain[0].previous = &chain.back();
    CHECK(Throws([&] { chain.back().depth.read(); }), true);
    chain[0].previous = nullptr;
    CHECK(chain.back().depth.read(), length + 1);
}

ROW(ManyWrites) {
    const int count = 20000;
    Field field;
    Operated operated;
    Watcher w;
    w.field = &field;
    w.operated = &operated;
    w.cells = count;
    field.cells.model().resize(count);
    CHECK(IsQuick([&] {
        for (int i = 0; i < count; ++i) operated.map[i] = 1;
        CHECK(w.ofField.read() == 0 && w.ofOperated.read() == count, true);
        for (int i = 0; i < 3 * count; ++i) {
            field.cells[i % count] = 1;
            operated.map[i % count] = 2;
            field.a = i;
        }
        CHECK(w.ofOperated.read() == 2 * count && w.ofField.read() == count + 3 * count - 1, true);
        for (int i = 0; i < count; ++i) field.a = i;
    }), true);
}
