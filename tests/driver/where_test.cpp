// Columns on their way between a generated line and its source. Positions in lines: tests/endtoend/where_test.py.

#include "driver/where.h"

#include <gtest/gtest.h>

namespace qrex {
namespace {

struct ColumnCase {
  std::string_view from;
  int64_t column;
  std::string_view to;
  int64_t expected;
};

TEST(WhereTest, ColumnsStayWithTheirWord) {
  constexpr ColumnCase kCases[] = {
      {"  int a;", 2, "  int a;", 2},                   // the same line, in its indentation
      {"    int a;", 9, "  int a;", 7},                 // indented on the way
      {"    int a;", 2, "  int a;", 3},                 // and there the column means nothing
      {"#include \"a.h\"", 11, "@import \"a.h\"", 10},  // by the word
      {"f(x) + g(x)", 10, "$f(x) + x", 9},              // the second of two, which is not that in another word
      {"f(x) + g(x)", 10, "$f(xx, x)", 8},              // or as many as there are
      {"void other();", 6, "  $class A", 3},            // no such word
      {"a", 999'999'999, "  b", 3},                     // behind the end
      {"", 1, "", 1},
      {"", 5, "  b", 3},
      {"\xC3\xA4\xC3\xB6 = 1;", 3, "$\xC3\xA4\xC3\xB6", 4},  // within a word of UTF-8
  };
  for (const ColumnCase& row : kCases) {
    ASSERT_EQ(row.expected, FollowColumn(row.from, row.column, row.to)) << row.from << " to " << row.to;
  }
}

TEST(WhereTest, PositionsAmongLinesOfSettings) {
  for (const char* position : {"a.h:1", "a b(1).h:3:4", "C:/a.h:12"}) ASSERT_TRUE(IsPosition(position)) << position;
  for (const char* other : {"mode=gen", "jobs=4", "config=\"a:1\"", "12", ":12", "a.h:", "a.h", ""}) {
    ASSERT_FALSE(IsPosition(other)) << other;
  }
}

}  // namespace
}  // namespace qrex
