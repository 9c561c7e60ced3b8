@import "compilable/src/row.h"

vxDefineTarget(compilable, 4)
void Register_Project_compilable();

int main()
{
    Register_Project_compilable();
    for (Row const* row = Row::s_first; row; row = row->next) row->check();
    std::printf("%d checks, %d failures\n", g_checks, g_failures);
    return g_failures > 0;
}
