// Sets of numbers that share what they have in common.

#include "text/index_set.h"

#include <gtest/gtest.h>

#include <random>
#include <set>
#include <vector>

namespace qrex {

// Sets that are copied, united and added to in any order stay apart, although they share their nodes.
TEST(IndexSetTest, IsASet) {
  std::mt19937 random(7);
  constexpr size_t kSets = 12;
  constexpr size_t kMost = 3000;
  std::vector<IndexSet> sets(kSets);
  std::vector<std::set<size_t>> expected(kSets);
  for (int step = 0; step < 3000; ++step) {
    const size_t a = random() % kSets;
    const size_t b = random() % kSets;
    const size_t number = random() % (step % 2 == 0 ? kMost : 200);
    switch (random() % 8) {
      case 0:
        sets[a] = sets[b];
        expected[a] = expected[b];
        break;
      case 1:
        sets[a].Add(sets[b]);
        expected[a].insert(expected[b].begin(), expected[b].end());
        break;
      case 2:
        if (random() % 4 == 0) {
          sets[a] = {};
          expected[a].clear();
        }
        break;
      default:
        sets[a].Add(number);
        expected[a].insert(number);
    }
    for (size_t i : {a, b}) ASSERT_EQ(expected[i].empty(), sets[i].Empty());
    if (step % 50 != 0) continue;
    for (size_t i = 0; i < kSets; ++i) {
      for (size_t n = 0; n < kMost + 100; ++n) ASSERT_EQ(expected[i].contains(n), sets[i].Has(n)) << step << " " << n;
    }
  }
}

}  // namespace qrex
