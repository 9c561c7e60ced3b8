// Text of scalars, and the registry: copies of records, what projects take along.
@import "rows/rows.h"
@import "check/src/nodes.h"

#include <clocale>
#include <locale>

vxDefineTarget(check, 1)
void Register_Project_check();
void Unregister_Project_check();
void CheckForgotten();

ROW(Texts) {
    char text[] = "text";
    CHECK(text, "text");
    CHECK(vxMakeString(0.1 << ' ' << 0.1f << ' ' << 1e300 << ' ' << 2.0 << ' ' << 123456789.25),
          "0.1 0.1 1e+300 2 123456789.25");
    CHECK(vxMakeString(int8(-5) << ' ' << vesk::uint64(-1) << ' ' << true << 'c'), "-5 18446744073709551615 truec");
    struct Grouping : std::numpunct<char> {
        char do_thousands_sep() const override { return '\''; }
        char do_decimal_point() const override { return ','; }
        std::string do_grouping() const override { return std::string(1, 3); }
    };
    const std::locale before = std::locale::global(std::locale(std::locale(), new Grouping));
    CHECK(vxMakeString(1234567 << ' ' << 1.5), "1234567 1.5");
    std::locale::global(before);
    CHECK(vesk::TextOf([](vesk::xostream& os) {
        vesk::ScopeWriter2 scope(os);
        os << 1 << "\n\n" << 2.5 << "x\n";
    }), "{\n    1\n\n    2.5x\n}\n");
}

ROW(Copies) {
    // What another module of the process would have.
    const vesk::ReflectedInterface record = vesk::GetReflectedInterface<kinds::IDoc>();
    vesk::ReflectedInterface other = record;
    other.m_numInheritedMethods += 1;
    Linked linked;
    CHECK(linked.QueryInterface(record).m_self && !linked.QueryInterface(other).m_self, true);
    const vesk::ReflectedClass copy = vesk::GetReflectedClass<Linked>();
    vesk::ReflectedClass unlike = copy;
    unlike.m_size += 1;
    {
        vesk::XTarget target("plug-in", 1);
        CHECK(vesk::RegisterReflectedClass(&copy, &target) == vesk::NSE_OK, true);
        CHECK(vesk::RegisterReflectedClass(&unlike, &target) == vesk::NSE_OK, false);
        unlike.m_name = "Alone";
        CHECK(vesk::RegisterReflectedClass(&unlike, &target) == vesk::NSE_OK, true);
        CHECK(vxMakeString(vesk::TargetOf(unlike)->m_name << ' ' << vesk::TargetOf(copy)->m_name), "plug-in check");
        vesk::UnregisterTarget(&target);
        CHECK(vesk::Find<vesk::ReflectedClass>("Alone") == nullptr, true);
    }
    CHECK(vesk::Find<vesk::ReflectedClass>("Linked") == &vesk::GetReflectedClass<Linked>(), true);
    CHECK(VESK_VERSION >= 10100, true);
}

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
