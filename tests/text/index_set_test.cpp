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
    const size_t a = random() % kSets, b = random() % kSets, number = random() % (step % 2 == 0 ? kMost : 200);
    if (const size_t what = random() % 8; what == 0) {
      sets[a] = sets[b];
      expected[a] = expected[b];
    } else if (what == 1) {
      sets[a].Add(sets[b]);
      expected[a].insert(expected[b].begin(), expected[b].end());
    } else {
      sets[a].Add(number);
      expected[a].insert(number);
    }
    for (size_t i = 0; step % 50 == 0 && i < kSets; ++i) {
      ASSERT_EQ(expected[i].empty(), sets[i].Empty());
      for (size_t n = 0; n < kMost + 100; ++n) ASSERT_EQ(expected[i].contains(n), sets[i].Has(n)) << step << " " << n;
      ASSERT_FALSE(sets[i].Has(~size_t{0}));
    }
  }
}

}  // namespace qrex
