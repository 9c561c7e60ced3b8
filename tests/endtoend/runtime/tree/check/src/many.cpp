// Long chains, many links, many keys: as fast for each as for few, and no deeper on the stack.
@import "rows/rows.h"
@import "check/src/nodes.h"

#include <ctime>

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
        CHECK(w.ofField.read(), 0);
        CHECK(w.ofOperated.read(), count);
        for (int i = 0; i < 3 * count; ++i) {
            field.cells[i % count] = 1;
            operated.map[i % count] = 2;
            field.a = i;
        }
        CHECK(w.ofOperated.read(), 2 * count);
        CHECK(w.ofField.read(), count + 3 * count - 1);
        for (int i = 0; i < count; ++i) field.a = i;
    }), true);
}
