// Scenarios in which memory runs out: each is carried out again and again, until every allocation of its actions has
// failed once. What then holds is asked with memory at hand.
@import "Vesk/vxObject/IObject.h"

#include <new>

// Which allocation fails, in one run of a scenario.
class Faults {
public:
    enum EWhich { One, AllBehind };
    explicit Faults(int position, EWhich which) : m_left(position), m_which(which) {}

    // Whether the action came to its end. Only here do allocations fail.
    template <typename Action>
    bool Try(Action action) {
        struct Scope {
            explicit Scope(Faults* faults) { s_active = faults; }
            ~Scope() { s_active = nullptr; }
        } scope(this);
        try {
            action();
            return true;
        } catch (std::bad_alloc const&) {
            return false;
        }
    }

    // What must hold, whatever has failed.
    void Expect(bool holds, const char* what);

    bool HasFailed() const { return m_hasFailed; }
    // Whether the allocation that is asked for now is the one.
    static bool Strike();

private:
    static inline thread_local Faults* s_active = nullptr;
    int m_left;
    EWhich m_which;
    bool m_hasFailed = false;
};

// A scenario makes what it needs itself, so that each of its runs begins alike.
struct Scenario {
    const char* name;
    void (*run)(Faults&);
};

vesk::xvector<Scenario> GraphScenarios();
