// The simulation, and the page that looks into it: greenhouse [SECONDS [PORT]].

@import "Vesk/vxObject/Inspector.h"
@import "greenhouse.h"

#include <cmath>
#include <thread>

vxDefineTarget(greenhouse, 2)
void Register_Project_greenhouse();

using vesk::xout;

namespace greenhouse
{

float64 House::Average(int32 first, int32 count) const
{
    float64 sum = 0;
    if (first < 0 || count < 1 || first + count > static_cast<int32>(readings.size())) throw std::out_of_range("no such readings");
    for (int32 i = 0; i < count; ++i) sum += readings[first + i];
    return sum / count;
}

void House::WaterAll(int32 percent)
{
    for (pref<IPlant> const& reference : plants.read())
    {
        Plant& plant = *static_cast<Plant*>(reference.Object());
        plant.water = std::max(0, std::min(100, plant.water + percent));
    }
}

}

using greenhouse::Plant;

int main(int argc, char** argv)
{
    Register_Project_greenhouse();

    greenhouse::Climate climate;
    greenhouse::House house;
    house.name = vesk::string8("South house");
    std::list<Plant> plants(4);
    const vesk::ConstStringZ names[] = {"Sweet Million", "Cayenne", "Genovese", "White lady"};
    const vesk::int32 colors[] = {0xf2d024, 0xffffff, 0x8e5fc0, 0xe8e0f0};
    for (Plant& plant : plants)
    {
        const vesk::ssize_t number = house.plants.read().size();
        plant.name = vesk::string8(names[number]);
        plant.species = static_cast<greenhouse::Species>(number);
        plant.height = 10.0 + 7 * number;
        plant.water = 60;
        plant.color = colors[number];
        house.plants.push_back(vesk::pref<greenhouse::IPlant>(&plant));
    }
    house.supplies["peat"] = 120.0;
    house.supplies["seeds"] = 0.75;
    house.notes.push_back(vesk::string8("The door of the <east> wall sticks"));
    for (int second = 0; second < 1000000; ++second) house.readings.push_back(std::round(180 + 60 * std::sin(second / 13750.0)) / 10);

    vesk::Inspector inspector("Greenhouse");
    inspector.Show("climate", climate);
    inspector.Show("house", house);
    inspector.AllowChanges();
    xout() << "Look at " << inspector.Listen(argc > 2 ? std::atoi(argv[2]) : 0) << '\n';
    xout().Target().flush();

    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(argc > 1 ? std::atoi(argv[1]) : 3600);
    auto minute = std::chrono::steady_clock::now();
    while (std::chrono::steady_clock::now() < end)
    {
        inspector.Poll();
        std::this_thread::sleep_for(std::chrono::milliseconds(2));
        if (std::chrono::steady_clock::now() < minute) continue;
        minute += std::chrono::milliseconds(250);
        for (Plant& plant : plants) plant.Grow(climate.growth);
        house.minutes = house.minutes + 1;
    }
    xout() << "After " << house.minutes << " minutes: " << plants.front().Describe(true) << '\n';
}
