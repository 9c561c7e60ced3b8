@import "rows/rows.h"

vxDefineTarget(check, 1)
void Register_Project_check();
void Unregister_Project_check();
void CheckForgotten();

// Goes when statics of the library might be gone.
struct Last {
    ~Last() {
        if (!vesk::Find<vesk::ReflectedInterface>("vesk::IObject") && vesk::All<vesk::ReflectedEnum>().empty()) {
            vesk::xout() << "last\n";
        }
    }
} g_last;

int main() {
    Register_Project_check();
    RunRows();
    CheckForgotten();
    Unregister_Project_check();
    CHECK(vesk::Find<vesk::ReflectedClass>("Linked") == nullptr, true);
    return g_failures > 0;
}
