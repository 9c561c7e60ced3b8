// What each directive leaves in the output, as text in and text out.

#include "expand_fixture.h"

namespace qrex {

using DirectivesTest = ExpandTest;

TEST_F(DirectivesTest, Cases) { AssertCases("macro/cases/directives.txt"); }

TEST_F(DirectivesTest, PlainTextPassesThrough) {
  const std::string text =
      "\n  a // @def\n\n\tb /* x\n   y */ 'q$(n)' \"$(n) $() $(1) $(n\" r\"\\\" 1.5e3;\f\v @ foo @ 1 @nowhere(1)\n  ";
  EXPECT_EQ(text, Expand(text));
  EXPECT_EQ("", Expand(""));
  EXPECT_EQ("@", Expand("@"));
}

// After some calls a body isn't scanned any more.
TEST_F(DirectivesTest, BodiesThatAreCalledOften) {
  constexpr int kCalls = 12;
  const struct {
    const char *definitions, *call, *expected;
  } kCases[] = {
      {"@def m(x, y) = x(y) 'x' y1 x@@y @ @ /* x */ \"x\" x", "m(a, b)", "a(b) 'x' y1 ab  /* x */ \"x\" a"},
      {"@def g(x) = <x>\n@def m(f(), v) = f(v) g(v) (v", "m(g, 1)", "<1> <1> (1"},
      {"@def g(x) = <x>\n@def m(v) = v g(g(v) `v`) v", "m(g(1))m(2)", "<1> <<<1>> `<1>`> <1>2 <<2> `2`> 2"},
      {"@nakeddef t(w) = { @def z = w\n}\n@def m(v) = <t(v) z>", "m(1)", "< 1>"},  // a name that comes on the way
  };
  for (const auto& [definitions, call, expected] : kCases) {
    std::string input = std::string(definitions) + "\n", all;
    for (int i = 0; i < kCalls; ++i) {
      input += call;
      all += expected;
    }
    EXPECT_EQ(all, ExpandAfresh(input)) << definitions;
  }
}

// The text of a C++ file is scanned as C++; what stands in the parentheses of a directive's expression is not.
TEST_F(DirectivesTest, CppText) {
  frame.dialect = Dialect::Cpp;
  frame.DefineSubstitution("v", "1");
  frame.AddVariable(std::make_unique<LSVar>("m", "M"));
  for (const auto& [name, text, expected] : TextCasesOf("macro/cases/cpp_text.txt")) EXPECT_EQ(expected, Expand(text));
}

TEST_F(DirectivesTest, Prints) {
  ::testing::internal::CaptureStdout();
  const std::string expansion = Expand("@def a = 1\n  @print(a)\n@println(b  \"c\" a)\nx");
  EXPECT_EQ("1b  \"c\" 1\n", ::testing::internal::GetCapturedStdout());
  EXPECT_EQ("x", expansion);
}

TEST_F(DirectivesTest, Imports) {
  files = {{"a", "@def f = 1\n@import \"b\"\n"}, {"b", "@def g = @where\n"}};
  EXPECT_EQ("  @import \"a\"\n1 here", Expand("  @import \"a\"\nf g"));
  EXPECT_EQ("x@import \"a\"\n1", Expand("x @import (\"a\" + \"\")\nf"));
  EXPECT_EQ("\nx", Expand("  @importpath \"p/q\"@importpath (\"r\")\nx"));
  EXPECT_EQ("p/q;r;", importPaths);
  takesImportPaths = false;
  EXPECT_EQ("t(2) : @importpath directive not supported", Expand("\n@importpath \"p\""));
  files["a"] = "\n@import \"none\"";
  EXPECT_EQ("a(2) : Can't import file: none", Expand("@import \"a\""));
}

}  // namespace qrex
