// A graph, a heap and archives in each of several threads at once. Prints what the threads come to.
@import "Vesk/vxObject/IObject.h"

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
$struct Plain : model { int32 number; xmap<int32,int32> map; } { };

$struct Chained
{
    Chained* previous = nullptr;
    $indep int32 x;
    $dep int32 depth = { depth = x + (previous ? previous->depth.read() : 0); };
};
$function Part* MakePart();
$function Part* MakePart() { return $new Part(); }

int Work(int rounds)
{
    int result = 0;
    int changes = 0;
    vesk::ModelHook hook([&changes](vesk::ModelChange const&) { ++changes; });
    vesk::xvector<Chained> chain(1000);
    for (std::size_t i = 0; i < chain.size(); ++i)
    {
        chain[i].x = 1;
        if (i > 0) chain[i].previous = &chain[i - 1];
    }
    Part part, other;
    part.next = &other;
    Plain plain;
    for (int i = 0; i < rounds; ++i)
    {
        chain[0].x = i;
        part.number = i;
        plain.number = i;
        plain.map[i] = i;
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
    return result + changes + int32(vesk::EvictionQueue::Get(0).Count());
}

int main()
{
    Register_Project_threads();
    int results[4];
    std::thread threads[4];
    for (int i = 0; i < 4; ++i) threads[i] = std::thread([&results, i] { results[i] = Work(20); });
    for (std::thread& thread : threads) thread.join();
    for (int result : results) std::printf("%d ", result - Work(20));
    std::printf("%d\n", int(vesk::ObjectHeap::Get().Count()));
}
