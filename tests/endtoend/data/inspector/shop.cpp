// A shop that is looked into: app loop|busy|readonly|serve|archives, or count N. It prints the address, and at its end what came
// of it.

@import "Vesk/vxObject/Inspector.h"
@import "app/src/shop.h"

#include <fstream>
#include <iostream>
#include <thread>

vxDefineTarget(app, 2)
void Register_Project_app();

static void Fill(shop::Shop& made, shop::Item* items)
{
    made.name = "<script>document.title = 'taken'</script>";
    made.wide = u"wide";
    made.half = 0.5f;
    made.whole = 0;
    made.letter = 'x';
    made.isOpen = false;
    made.tiny = 1;
    made.huge = 18446744073709551615u;
    made.vast = -1;
    made.size = shop::Small;
    made.anything = int32(7);
    made.numbers = {1, 2, 3};
    made.bits = {true, false, true};
    made.names = {"a", "b\"<b>", "\xff bad"};
    made.queue = {10, 20};
    made.set = {3, 1};
    made.stock = {{"apples", 4}, {"<img src=x onerror=alert(1)>", 5}, {"]odd", 6}};
    made.aisles = {{-1, "cellar"}};
    made.spots.resize(2);
    for (int i = 0; i < 1000000; ++i) made.many.push_back(i);
    for (int i = 0; i < 2; ++i)
    {
        items[i].label = vesk::string8(i ? "second" : "first");
        items[i].price = 10.0 * (i + 1);
        made.items.push_back(vesk::pref<shop::IItem>(&items[i]));
    }
    items[0].next = vesk::pref<shop::IItem>(&items[1]);
    items[1].next = vesk::pref<shop::IItem>(&items[0]);
}

int main(int argc, char** argv)
{
    const std::string mode = argc > 1 ? argv[1] : "loop";
    Register_Project_app();
    shop::Item items[2];
    shop::Shop made;
    Fill(made, items);
    vesk::Inspector inspector("Shop <b>");
    inspector.Show("shop", made);
    const shop::Spot fixed = shop::Spot();
    inspector.Show("spot", fixed);
    inspector.ShowObject("item", vesk::ptr<shop::IItem>(&items[0]));
    inspector.ShowBy("broken", []() -> vesk::Value { throw std::runtime_error("no <source>"); });
    if (mode == "serve")
    {
        std::thread ending([&] { std::cin.get(); inspector.Stop(); });
        inspector.Serve();
        ending.join();
        return 0;
    }
    if (mode == "archives")
    {
        for (char const* name : {"one.bin", "two.bin"})
        {
            const vesk::xvector<vesk::octet_t> bytes = vesk::WriteObject(vesk::ptr<shop::IItem>(items));
            std::ofstream(name, std::ios::binary).write(reinterpret_cast<char const*>(bytes.data()), bytes.size());
            items[0].price = 99.0;
        }
        return 0;
    }
    const vesk::ModelHook guard([](vesk::ModelChange const& change) {
        if (change.PathText() == "color") throw std::runtime_error("the colour stays");
    });
    inspector.AllowChanges(mode != "readonly");
    if (mode == "count")  // what Poll costs while nobody looks
    {
        inspector.Listen();
        for (int i = std::atoi(argv[2]); i > 0; --i) inspector.Poll();
        return 0;
    }
    inspector.Limits().m_time = std::chrono::milliseconds(1500);
    vesk::xout() << inspector.Listen() << '\n';
    vesk::xout().Target().flush();
    std::atomic<bool> isOver{false};
    std::thread input([&] { std::cin.get(); isOver = true; });
    for (int turn = 0; !isOver; ++turn)
    {
        inspector.Poll();
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
        if (mode == "busy") for (int i = 0; i < 1000; ++i) items[1].price = static_cast<float64>(i % 1000);
    }
    input.join();
    vesk::xout() << "rate " << made.rate << ", twice " << made.twice << '\n';
}
