// What the declarations of one header mean: a list of checks that fills itself.
#pragma once
@import "check/src/check.h"

struct Row
{
    explicit Row(void (*check)()) : check(check), next(s_first) { s_first = this; }
    void (*check)();
    Row* next;
    static inline Row* s_first = nullptr;
};
#define ROW static void CheckRow(); static const Row s_row(CheckRow); static void CheckRow()

// Through an archive.
template <typename T>
void Copy(T const& from, T& to)
{
    vesk::Archive ar;
    ar << from;
    vesk::InputArchive input(ar);
    input >> to;
}
