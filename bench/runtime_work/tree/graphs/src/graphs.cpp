// Nodes, models, hooks and variants, each beside what does the same by hand. A line of theirs is "name_hand seconds".
@import "Vesk/vxObject/IObject.h"

#include "timing.h"

#include <deque>
#include <memory>
#include <variant>

vxDefineTarget(graphs, 1)

$struct Doubled
{
    $indep int32 source;
    $dep int32 twice = { twice = source * 2; };
};
struct DoubledByHand
{
    void Set(int32 value) { m_source = value; m_isDirty = true; }
    int32 Twice()
    {
        if (m_isDirty) m_twice = m_source * 2;
        m_isDirty = false;
        return m_twice;
    }
    int32 m_source = 0, m_twice = 0;
    bool m_isDirty = true;
};

$class+ Order isa vesk::IObject : model { int32 amount; int32 price; xvector<int32> lines; }
{
public:
    $dep int32 total = { total = amount * price; };
};

$struct Linked
{
    Linked* previous = nullptr;
    $indep int32 x;
    $dep int32 depth = { depth = (previous ? previous->depth.read() : 0) + x; };
};
$variant+ Shape { default 0; int32; vesk::string8; vesk::xvector<int32>; };
typedef std::variant<int32, std::unique_ptr<vesk::string8>, std::unique_ptr<vesk::xvector<int32>>> ShapeByHand;

// What may not be moved out of a loop.
template <typename T>
void Keep(T const& value) { g_kept = &value; asm volatile("" ::: "memory"); }

void Writes()
{
    Doubled doubled;
    Measure("indep", [&] {
        for (int i = 0; i < kWrites; ++i)
        {
            doubled.source = i;
            Keep(doubled.twice.read());
        }
    });
    Order order;
    order.price = 3;
    Measure("model", [&] {
        for (int i = 0; i < kWrites; ++i)
        {
            order.amount = i;
            Keep(order.total.read());
        }
    });
    DoubledByHand byHand;
    const auto write = [&] {
        for (int i = 0; i < kWrites; ++i)
        {
            byHand.Set(i);
            Keep(byHand.Twice());
        }
    };
    Measure("indep_hand", write);
    Measure("model_hand", write);
}

void Hooks()
{
    int changes = 0;
    Order order;
    {
        vesk::ModelHook hook([&changes](vesk::ModelChange const& change) { changes += change.m_kind; });
        Measure("hook", [&] {
            for (int i = 0; i < kWrites; ++i)
            {
                order.amount = i;
                Keep(order);
            }
        });
    }
    std::function<void(int32)> function = [&changes](int32 kind) { changes += kind; };
    Keep(function);
    Measure("hook_hand", [&] {
        for (int i = 0; i < kWrites; ++i)
        {
            function(i);
            Keep(changes);
        }
    });
}

void Vectors()
{
    Measure("push", [] {
        Order order;
        for (int i = 0; i < kWrites; ++i) order.lines.push_back(i);
        Keep(order);
    });
    Measure("push_hand", [] {
        vesk::xvector<int32> lines;
        for (int i = 0; i < kWrites; ++i)
        {
            lines.push_back(i);
            Keep(lines);
        }
    });
    Measure("variants", [] {
        vesk::xvector<Shape> shapes;
        for (int i = 0; i < kWrites; ++i) shapes.push_back(Shape(vesk::xvector<int32>(2, i)));
        Keep(shapes);
    });
    Measure("variants_hand", [] {
        std::vector<ShapeByHand> shapes;
        for (int i = 0; i < kWrites; ++i) shapes.push_back(ShapeByHand(std::make_unique<vesk::xvector<int32>>(2, i)));
        Keep(shapes);
    });
}

void Chain()
{
    MeasureAfter("chain", [] {
        auto chain = std::make_unique<std::deque<Linked>>(kWrites);
        for (int i = 1; i < kWrites; ++i) (*chain)[i].previous = &(*chain)[i - 1];
        return chain;
    }, [](auto const& chain) { Keep(chain->back().depth.read()); });
}

int main()
{
    Writes();
    Hooks();
    Vectors();
    Chain();
}
