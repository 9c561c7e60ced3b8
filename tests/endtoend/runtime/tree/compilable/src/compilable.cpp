@import "rows/rows.h"

vxDefineTarget(compilable, 4)
void Register_Project_compilable();

int main() {
    Register_Project_compilable();
    return RunRows();
}
