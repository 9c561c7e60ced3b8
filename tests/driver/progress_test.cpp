// The status line in the room that there is.

#include "driver/progress.h"

#include <gtest/gtest.h>

namespace qrex {
namespace {

TEST(ProgressTest, LinesInTheirColumns) {
  const ProgressState plain{17, 240, 3, 12, "app/src/x.cpp"};
  const ProgressState link{239, 240, 1, 3671, "linking app", 160};
  const ProgressState wide{1, 2, 1, 0, "a\n\x1b[31m\xff/\u4e2d\u6587\u5b57/\u00e9.cpp"};
  const std::tuple<ProgressState, size_t, const char*> cases[] = {
      {plain, 80, "[17/240] 3 running, 0:12, app/src/x.cpp"},
      {plain, 40, "[17/240] 3 running, 0:12, app/src/x.cpp"},
      {plain, 39, "[17/240] 3 running, 0:12, ...src/x.cpp"},
      {plain, 34, "[17/240] 3 running, 0:12"},
      {plain, 24, "[17/240] 3 running"},
      {plain, 18, "[17/240]"},
      {plain, 8, ""},
      {plain, 0, ""},
      {link, 80, "[239/240] 1 running, 1:01:11, linking app (2:40)"},
      {link, 46, "[239/240] 1 running, 1:01:11, ...g app (2:40)"},
      {{0, 9, 0, 0, "t.h", 1}, 80, "[0/9] 0:00, t.h"},
      {wide, 80, "[1/2] 1 running, 0:00, a??[31m\u00ff/\u4e2d\u6587\u5b57/\u00e9.cpp"},
      {wide, 38, "[1/2] 1 running, 0:00, ...\u6587\u5b57/\u00e9.cpp"},
  };
  for (const auto& [state, columns, expected] : cases) {
    EXPECT_EQ(expected, ProgressLine(state, columns)) << columns;
    EXPECT_LT(platform::ColumnsOf(expected), std::max<size_t>(columns, 1));
  }
}

}  // namespace
}  // namespace qrex
