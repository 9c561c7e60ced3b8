// A graph, a heap, archives, a connection and values by name in each of several threads at once, which print as well.
// Prints what the threads come to.
@import "Vesk/vxObject/IObject.h"
@import "Vesk/vxObject/Json.h"

#include <cstdio>
#include <thread>

vxDefineTarget(threads, 1)
void Register_Project_threads();

$interface+ IPart : vesk::IPersistable { };
$class+ Part isa IPart : model { int32 number; pref<IPart> next; }
{
public:
    $dep int32 twice = { twice = number * 2; };
    $cache <<async>> int32 later(int32 n) const with int32 in = { in = number + n; }; { return in; }
};
$model+ Plain { int32 number; xmap<int32,int32> map; openvariant<int32> any; };
$interface+ rmi ISum : vesk::IObject {
    void Add([in] int32 n, [out] int32& total);
};
$class+ Sum isa ISum {
public:
    void Add(int32 n, int32& out) { out = total += n; }
    $int32 total;
};

$struct Chained {
    Chained* previous = nullptr;
    $indep int32 x;
    $dep int32 depth =
    {
        if (x < 0) throw std::range_error("negative");
        depth = x + (previous ? previous->depth.read() : 0);
    };
};
$function Part* MakePart();
$function Part* MakePart() { return $new Part(); }

// Calls an object of this thread, and changes it by name.
int CallSum(int rounds) {
    Sum sum;
    sum.total = 0;
    vesk::LocalChannel channel;
    vesk::Server server(channel.Server());
    vesk::ClientConnection client(channel.Client(), [&server] { server.Serve(); });
    const auto stub = vesk::Import<ISum>(client, server.Export(vesk::ptr<ISum>(&sum)));
    const vesk::ptr<ISum> far(stub->Interface());
    int32 total = 0;
    for (int i = 0; i < rounds; ++i) {
        far->Add(i, total);
        vesk::Value::Of(sum).Find("total").Set(int32(total + 1));
    }
    return total;
}

vesk::xvector<Chained> Chain(std::size_t length) {
    vesk::xvector<Chained> chain(length);
    for (std::size_t i = 1; i < length; ++i) chain[i].previous = &chain[i - 1];
    for (Chained& link : chain) link.x = 1;
    return chain;
}

// What the end of a chain says which needs more stacks than one; the error at its beginning comes to the end.
int Deep() {
    vesk::xvector<Chained> chain = Chain(5000);
    const int length = chain.back().depth;
    chain[0].x = -1;
    for (Chained& link : chain) link.depth.TryEvict(true);
    try {
        chain.back().depth.read();
    } catch (std::range_error const&) {
        chain[0].x = 2;
        return length + chain.back().depth;
    }
    return 0;
}

int Work(int rounds) {
    int result = 0;
    int changes = 0;
    vesk::ModelHook hook([&changes](vesk::ModelChange const&) { ++changes; });
    vesk::xvector<Chained> chain = Chain(1000);
    Part part, other;
    part.next = &other;
    Plain plain;
    for (int i = 0; i < rounds; ++i) {
        chain[0].x = i;
        part.number = i;
        plain.number = i;
        plain.map[i] = i;
        plain.any = vesk::openvariant<int32>(int32(i));
        Plain copy;
        vesk::FromJsonText(copy, vesk::ToJsonText(plain));
        result += copy.any.as<int32>() + int32(copy.map.size());
        result += chain.back().depth + part.twice + part.later(i);
        result += int32(vesk::RunAsyncCalculations());
        const vesk::ptr<IPart> read = vesk::ReadObject<IPart>(vesk::WriteObject(vesk::ptr<IPart>(&part)));
        result += static_cast<Part*>(read.Object())->number;
        static_cast<Part*>(read.Object())->next.read()->DestroyObject();
        read->DestroyObject();
        MakePart()->DestroyObject();
        if (!vesk::Find<vesk::ReflectedClass>("Part")) result = 0;
    }
    vesk::EvictionQueue::Get(0).EvictDownTo(-1);
    return result + changes + CallSum(rounds) + int32(vesk::EvictionQueue::Get(0).Count());
}

int main() {
    Register_Project_threads();
    int results[4];
    std::thread threads[4];
    auto work = [](int& result) {
        vesk::xostream& os = vesk::xout();
        for (int i = 0; i < 20; ++i) os << "a line\n";
        os.ChangeIndent(4);
        result = Work(20) + Deep() - 10001;
        os.ChangeIndent(-4);
    };
    for (int i = 0; i < 4; ++i) threads[i] = std::thread(work, std::ref(results[i]));
    for (std::thread& thread : threads) thread.join();
    vesk::xout() << "flush left\n";
    for (int result : results) std::printf("%d ", result - Work(20));
    std::printf("%d\n", int(vesk::ObjectHeap::Get().Count()));
}
