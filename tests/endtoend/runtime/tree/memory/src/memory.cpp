@import "memory.h"

#include <cstdio>
#include <cstdlib>

vxDefineTarget(memory, 1)
void Register_Project_memory();

namespace {

Scenario g_scenario;
int g_position;
int g_failures;

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
    for (auto list : {GraphScenarios, ContainerScenarios, ValueScenarios}) {
        for (Scenario const& scenario : list()) {
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
