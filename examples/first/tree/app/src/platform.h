#include <cstdio>

inline void PrintPlatform()
{
    std::printf("%s\n", @str(@project for @platform, @config, on @system_name));
}
