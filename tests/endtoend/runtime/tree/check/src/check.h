// Compares what a check gives with what it must, as text.
@import "Vesk/vxObject/IObject.h"

#include <cstdio>

inline int g_checks = 0;
inline int g_failures = 0;

template <typename Got, typename Expected>
void Compare(Got const& got, Expected const& expected, const char* what, int line)
{
    ++g_checks;
    const vesk::xstring gotText = vxMakeString(got);
    const vesk::xstring expectedText = vxMakeString(expected);
    if (gotText == expectedText) return;
    ++g_failures;
    std::printf("%d: %s is %s, not %s\n", line, what, gotText.c_str(), expectedText.c_str());
}
#define CHECK(got, expected) Compare(got, expected, #got, __LINE__)

template <typename Action>
bool Throws(Action action)
{
    try
    {
        action();
    }
    catch (std::exception const&)
    {
        return true;
    }
    return false;
}
