// Times what the programs of the benchmark do: each prints a line "name seconds", the best of many runs, so that the
// lines of one program can be held against those of another.
#pragma once

#include <malloc.h>

#include <algorithm>
#include <chrono>
#include <cstdio>

constexpr int kInts = 4000000;
constexpr int kRecords = 200000;
constexpr int kWrites = 100000;

// Keeps what was computed.
inline const void* volatile g_kept;

// Freed memory stays with the program: whether the system has to clear pages anew for each run depends on how sizes
// meet the allocator's thresholds, not on who allocates.
inline const bool g_keepsMemory = mallopt(M_MMAP_THRESHOLD, 1 << 30) && mallopt(M_TRIM_THRESHOLD, 1 << 30);

// The action is given what is made anew for each run, which does not count.
template <typename Make, typename Action>
void MeasureAfter(const char* name, Make make, Action action) {
  double best = 1e9;
  for (int i = 0; i < 2; ++i) {
    const auto made = make();
    const auto begin = std::chrono::steady_clock::now();
    action(made);
    best = std::min(best, std::chrono::duration<double>(std::chrono::steady_clock::now() - begin).count());
  }
  std::printf("%s %.6f\n", name, best);
}

template <typename Action>
void Measure(const char* name, Action action) {
  MeasureAfter(name, [] { return 0; }, [&](int) { action(); });
}
