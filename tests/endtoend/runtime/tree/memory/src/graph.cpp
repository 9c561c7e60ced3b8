@import "memory.h"

$warning(disable: 1009)

$struct Sums {
    $indep int32 x;
    $dep int32 a = { a = x; };
    $dep int32 b = { b = a + x + 100; };
    $dep vesk::string8 text = { text = vesk::string8(40, char(b)); };
    $cache int32 plus(int32 n) const { return x + n; }
    $dep int32 ofCache = { ofCache = plus(1); };
    $cache <<async>> int32 later() const with int32 in = { in = x; }; { return in * 2; }
};

// Goes on without what it cannot have.
$struct Careless {
    Sums* sums = nullptr;
    $dep int32 taken =
    {
        taken = -1;
        try { taken = sums->b + sums->plus(2); } catch (std::bad_alloc const&) {}
    };
};

$struct Many {
    vesk::xvector<Sums>* all = nullptr;
    $dep int32 total =
    {
        total = 0;
        for (int round = 0; round < 2; ++round) {
            for (Sums const& one : *all) total += one.x;
        }
    };
};

$struct Writer {
    $indep int32 x;
    $dep int32 counted = { counted = x; if (counted < 10) const_cast<Writer*>(this)->x = counted + 1; };
};

$struct Chained {
    Chained* previous = nullptr;
    $indep int32 x;
    $dep int32 depth = { depth = x; if (previous) depth += previous->depth; };
};

$struct+ Operated isa vesk::IObject : model { int32 a; xmap<string8,int32> words; } { };
$struct+ Named <<-genop>> isa vesk::IObject : model { int32 a; xmap<int32,int32> map; } { };
$struct Watcher {
    Operated* operated = nullptr;
    Named* named = nullptr;
    $dep int32 ofOperated = { ofOperated = operated->a + operated->words["a word of some length"]; };
    $dep int32 ofNamed = { ofNamed = named->a + named->map[7]; };
    $dep int32 careless = { careless = -1; try { careless = operated->a + named->a; } catch (std::bad_alloc const&) {} };
};

namespace {

void Changes(Faults& faults) {
    Sums sums;
    Careless careless;
    careless.sums = &sums;
    sums.x = 1;
    faults.Try([&] {
        sums.text.read();
        careless.taken.read();
        sums.x = 5;
        careless.taken.read();
        sums.x = 6;
    });
    const int32 x = sums.x;
    faults.Expect(sums.b == 2 * x + 100 && sums.text.read()[0] == char(2 * x + 100), "values follow");
    faults.Expect(careless.taken == 3 * x + 102, "what goes on without an input follows it");
    sums.x = 7;
    faults.Expect(careless.taken == 123, "what goes on without an input still follows it");
}

void ManyInputs(Faults& faults) {
    vesk::xvector<Sums> all(40);
    Many many;
    many.all = &all;
    faults.Try([&] {
        for (Sums& one : all) one.x = 1;
        many.total.read();
        all[30].x = 2;
        many.total.read();
    });
    for (Sums& one : all) one.x = 3;
    faults.Expect(many.total == 240, "values follow");
    all[35].x = 4;
    faults.Expect(many.total == 242 && many.total.Inputs().size() == 40, "values follow once more");
}

void WritesInside(Faults& faults) {
    Writer writer;
    writer.x = 7;
    faults.Try([&] {
        for (int i = 0; i < 5; ++i) writer.counted.read();
    });
    for (int i = 0; i < 5; ++i) writer.counted.read();
    faults.Expect(writer.counted == 10, "what a calculation wrote is read");
}

void Chains(Faults& faults) {
    vesk::xvector<Chained> chain(12);
    for (std::size_t i = 0; i < chain.size(); ++i) {
        chain[i].x = 1;
        if (i > 0) chain[i].previous = &chain[i - 1];
    }
    faults.Try([&] {
        chain.back().depth.read();
        chain[0].x = 2;
        chain[3].x = 2;
        chain.back().depth.read();
        chain[5].depth.TryEvict(true);
        chain.back().depth.read();
        Chained copy = chain[5];
        chain[6] = copy;
    });
    for (Chained& link : chain) link.x = 3;
    faults.Expect(chain.back().depth == 36 || chain[6].previous != &chain[5], "values follow");
}

void Caches(Faults& faults) {
    Sums sums;
    sums.x = 1;
    faults.Try([&] {
        sums.ofCache.read();
        for (int i = 0; i < 4; ++i) sums.plus(i);
        vesk::EvictionQueue::Get(0).EvictDownTo(-1);
        sums.ofCache.read();
    });
    faults.Expect(sums.plus(1) == 2 && sums.ofCache == 2, "values of keys");
    sums.x = 2;
    faults.Expect(sums.plus(1) == 3 && sums.ofCache == 3, "values of keys follow");
}

void AsyncCaches(Faults& faults) {
    Sums sums;
    sums.x = 1;
    faults.Try([&] {
        sums.later();
        vesk::RunAsyncCalculations();
        sums.x = 2;
        sums.later();
    });
    sums.x = 3;
    sums.later();
    vesk::RunAsyncCalculations();
    faults.Expect(sums.later() == 6, "an async value");
}

void Models(Faults& faults) {
    Operated operated;
    Named named;
    Watcher watcher;
    watcher.operated = &operated;
    watcher.named = &named;
    operated.words["a word of some length"] = 1;
    named.map[7] = 1;
    faults.Try([&] {
        watcher.careless.read();
        watcher.ofOperated.read();
        watcher.ofNamed.read();
        operated.a = 5;
        named.a = 5;
        named.map[7] = 2;
        watcher.ofOperated.read();
        watcher.ofNamed.read();
        watcher.careless.read();
    });
    faults.Expect(watcher.ofOperated == operated.a + 1 && watcher.ofNamed == named.a + named.map[7], "values of models");
    faults.Expect(watcher.careless == operated.a + named.a, "what goes on without a field follows it");
    operated.a = 6;
    named.a = 6;
    faults.Expect(watcher.ofOperated == 7 && watcher.ofNamed == 6 + named.map[7], "values of models follow");
    faults.Expect(watcher.careless == 12, "what goes on without a field still follows it");
    operated.words["a word of some length"] = 9;
    faults.Expect(watcher.ofOperated == 15, "values of elements follow");
}

}

vesk::xvector<Scenario> GraphScenarios() {
    return {{"changes", Changes},          {"many inputs", ManyInputs}, {"writes inside", WritesInside},
            {"chains", Chains},          {"caches", Caches},            {"async caches", AsyncCaches}, {"models", Models}};
}
