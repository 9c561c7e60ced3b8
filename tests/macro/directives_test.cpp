// What each directive leaves in the output, as text in and text out.

#include "expand_fixture.h"

namespace qrex {

struct Expansion {
  const char* input;
  const char* expected;
};

class DirectivesTest : public ExpandTest {
 protected:
  template <size_t N>
  void AssertExpand(const Expansion (&cases)[N]) {
    for (const Expansion& expansion : cases) {
      EXPECT_EQ(expansion.expected, ExpandAfresh(expansion.input)) << expansion.input;
    }
  }
};

TEST_F(DirectivesTest, PlainTextPassesThrough) {
  const std::string text =
      "\n  a // @def\n\n\tb /* x\n   y */ 'q$(n)' \"$(n) $() $(1) $(n\" r\"\\\" 1.5e3;\f\v @ foo @ 1 @nowhere(1)\n  ";
  EXPECT_EQ(text, Expand(text));
  EXPECT_EQ("", Expand(""));
  EXPECT_EQ("@", Expand("@"));
}

TEST_F(DirectivesTest, PasteAndComments) {
  AssertExpand({
      {"@def a = x\n@def b = y\na@@b a@ @b @@", "xy xy "},
      {"abc @// comment\ndef", "abcdef"},
      {"  @/* one\n two */\n\n \n  x", "  x"},
      {"a @/* c */ b", "ab"},
  });
}

TEST_F(DirectivesTest, Calls) {
  AssertExpand({
      {"@def f = 1\nf(x) ff \"f\" /*f*/", "1(x) ff \"f\" /*f*/"},
      {"@def f() = 1\nf()", "1()"},
      {"@def p(x, y) = [x|y]\np(g(1,2), `a,(b`) p(,)", "[g(1,2)|a,(b] [|]"},
      {"@def p(x) = x x\n@def a = 1\np(a)@def a = 2\n", "1 1"},
      {"@def v = outer\n@def m(x) = { @def v = inner\nx v}\nm(v)", "outer inner"},  // an argument is its caller's
      {"@def m = v\n@scope {@def v = 1\nm}@scope {@def v = 2\nm}", "12"},           // a body sees where it is called
      {"@def int twice(int x) = x * 2\ntwice(1 + 2)", "6"},
      {"@def bool odd(int x) = x % 2 == 1\nodd(3)odd(4)", "truefalse"},
      {"@def char c(string s) = @str(s)[1]\nc(\"xyz\")", "'y'"},
      {"@def apply(f(), v) = f(v)\n@def sq(x) = (x*x)\napply(sq, 3)", "(3*3)"},
      {"@def w = zebra\nw w\n@def zebra = 1\nw", "zebra zebra\n1"},  // plain until there is such a name
      {"@def k(x) = { x x @scope { @def+ zebu = {2} } x }\nk(zebu)", " zebu zebu  2 "},
      {"@def twice(f()) = f(f(1))\n@def g(x) = <x>\ntwice(g)", "<<1>>"},
  });
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
  AssertExpand({
      {"@def m(x) = <x x>\nm(1)m(2)m(3)m(4)m(5)m(6)m(7)m(8)m(9)m(@def q = 1\nm(@def r = 2\nm(6)))",
       "<1 1><2 2><3 3><4 4><5 5><6 6><7 7><8 8><9 9><<<6 6> <6 6>> <<6 6> <6 6>>>"},
      {"@def m(x) = x late\nm(1)m(2)m(3)m(4)m(5)m(6)m(7)m(8)@def late = L\nm(9)m(0)",
       "1 late2 late3 late4 late5 late6 late7 late8 late9 L0 L"},
  });
}

TEST_F(DirectivesTest, LayoutOfBodies) {
  AssertExpand({
      {"@def f(x) =\n{\n    first x\n      second\n\n    last\n}\n  <f(1)>\n",
       "  <first 1\n     second\n   \n   last>\n"},
      {"@def f = {\n    a\n  }\n|f|\n", "|    a\n   |\n"},
      {"@def f = { x } rest\n<f>", "rest\n< x >"},
      {"@def f = a  b // c\n<f>", "<a  b // c>"},
      {"@def f =\n{\n\ta\n\t\tb\n}\n f", " a\n \tb"},
      {"@def f =\n{\n}\n<f>", "<>"},
      {"@def g =\n{\n  1\n  2\n}\n@def f =\n{\n  (g\n  )\n}\n:f", ":(1\n  2\n )"},
  });
}

TEST_F(DirectivesTest, Definitions) {
  AssertExpand({
      {"@scope { @def+ a = 1\n@def b = 2\n@exportdef c = 3\n}a b c", "1 b 3"},
      {"@nakeddef set(x) = { @def y = x\n}\nset(7)y x", "7 7"},
      {"@def a = 1\n@def a = 2\na", "2"},
      {"@def a = 1\n@scope {@def a = 2\na}a", "21"},
      {"  @def a = 1\n\n\n  a", "  1"},
      {"@[@quote(@def+ made(x) = <x@@x>)]made(1)", "<11>"},
      {"@nakeddef g(x) = {}\n@def f(h()) = h(1@@2)\nf(g)x", "12"},  // x outlives the text that it came in
      {"@def t(int x) = x\n@[@quote(t(@def+ kept = 5\n3))]kept", "35"},
  });
}

TEST_F(DirectivesTest, Conditions) {
  AssertExpand({
      {"@if (1 < 2) { yes } @else { no }|", " yes |"},
      {"@if (false) { a }\n@elseif (true) // c\n{ b }\n@else { c }\n|", " b \n|"},
      {"@if (false) { a }\n// c\n@else { c }\n|", " c \n|"},
      {"  @if (false) { x }\n|", "  \n|"},
      {"  @if (true)\n  {\n      a\n        b\n  }\n|", "  a\n    b\n|"},
      {"@if (true) to the end\n@elseif (true) not\n|", "to the end\n|"},
      {"@if (true) {} @elsewhere", " @elsewhere"},
      {"@elseif (true) {}", "@elseif (true) {}"},
      {"@def t = true\n@if (t && !false) {1}", "1"},
  });
}

TEST_F(DirectivesTest, Loops) {
  AssertExpand({
      {"@let int i = 0\n@while (i < 3) { <i> @let i = i + 1\n}|", " <0> <1> <2>|"},
      {"@while (false) {x}|", "|"},
      {"@for (x in [a, (b, c), `d,e`]) { x;}\n", " a; (b, c); d,e;\n"},
      {"@for (x in []) {x}@for (x in [ ]) {x}@for (x in [a,]) {<x>}@for (x in [,]) {<x>}", "<a><>"},
      {"@for ((a,b) in [(1,2),(3,(4,5))]) {a-b }", "1-2 3-(4,5) "},
      {"@def l = [1,2]\n@for (x in l) {x.}", "1.2."},
      {"@for (x in [1,2])\n{\n    x\n      +\n}\n", "1\n  +2\n  +\n"},
      {"@for (x in [1,2]) {@for (y in [x,3]) {y }}", "1 3 2 3 "},
  });
}

TEST_F(DirectivesTest, ExpressionsAndDoubleExpansion) {
  AssertExpand({
      {"@(1 + 2) @(\"a\" + string(1)) @(1.5) @(true) @('\"')", "3 a1 1.5 true \""},
      {"@def n = m@@1\n@def m1 = found\nn @[n]", "m1 found"},
      {"  @[1\n2]", "  1\n2"},
  });
}

TEST_F(DirectivesTest, Strings) {
  AssertExpand({
      {"@str(a\"b\"c\t?) @strW(a)", "\"a\\\"b\\\"c\\t\\?\" L\"a\""},
      {"@def a = 1\n@str(a 'a')", "\"1 \\'a\\'\""},
      {"@str(a\nb)", "\"a\\nb\""},
      {"  x = @strx(\n        one\n  two\n    );\n", "  x = \"        one\\n\"\n      \"  two\\n\"\n      \"    \";\n"},
      {"@strx(one\n);", "\"one\\n\"\n;"},
      {"@strxW(one\n);", "L\"one\\n\"\nL\"\";"},
      {" @strx\n(\n    one\n      two\n)", " \"one\\n\"\n \"  two\""},
      {"@unstr(\"a\\tb\\x41\\?\")|@unstr(@str(x y))|@unstr('\"')", "a\tbA?|x y|\""},
      {" @unstr(\"a\\nb\")", " a\n b"},
      {"@def a = 1\n  @quote\n  (\n    a @b\n      c\n  )|\n", "  a @b\n    c|\n"},
      {"@[@quote(\n a)]", " a"},
  });
}

TEST_F(DirectivesTest, Values) {
  AssertExpand({
      {"  @let int i = 1\n\n@let i = i + 1\ni", "2"},
      {"@let string s := a  b\n<s>@let s := s c\n<s>", "<a  b><a  b c>"},
      {"@let bool b = 1 < 2\n@let double d = 0.1\n@let char c = 'c'\n@let string s = \"x\" + \"y\"\nb d c s",
       "true 0.10000000000000000555 'c' xy"},
      {"@let int x = 1\n@scope {@let int x = 2\nx}x", "21"},
      {"@let int x = 1\n@scope {@let x = 2\nx}x", "22"},
      {"@let char n = char(10)\nn", "'\\n'"},
      {"@let int x = 1\nx(2)", "1(2)"},
      {"@where @nowhere", "here @nowhere"},
  });
}

TEST_F(DirectivesTest, Substitutions) {
  AssertExpand({
      {"@$n = \"v\"\n\"$(n)\" '$(n)' _n_ \"$(m)$(n)\"", "\n\"v\" '$(n)' v \"$(m)v\""},
      {"@$a = \"$(b)\"@$b = (\"x\" + \"y\")\"$(a)\"@$a = \"$\"\"$(a)(b)\"_a_", "\"xy\"\"xy\"$"},
      {"@scope {@$n = \"v\"}", "@$n = \"v\""},
  });
}

TEST_F(DirectivesTest, ChecksAndPaths) {
  AssertExpand({
      {"  @assert(1 < 2)\nx", "x"},
      {"@assertfails(@fail(\"x\"))\n@assertfails{@undefined(}\ny",
       "t(2) : Macro expansion of @undefined( didn't generate an error"},
      {"@assertfails[@assert(false)] y", "y"},
      {"  x @relativepath(\"a/b/c\", \"a\\\\d/e/\");\n", "  x\"../../b/c\";\n"},
  });
}

// The text of a C++ file is scanned as C++; what stands in the parentheses of a directive's expression is not.
TEST_F(DirectivesTest, CppText) {
  frame.dialect = Dialect::Cpp;
  frame.DefineSubstitution("v", "1");
  frame.AddVariable(std::make_unique<LSVar>("m", "M"));
  EXPECT_EQ("R\"(m $(v) @if })\" u8\"m 1\" 1'0 M // m", Expand("R\"(m $(v) @if })\" u8\"m $(v)\" 1'0 m // m"));
  EXPECT_EQ("#error don't { M\nM", Expand("#error don't { M\nm"));
  EXPECT_EQ("[R\"(,)\"][1'0,]", Expand("@def f(a, b) = [a][b]\nf(R\"(,)\", `1'0,`)"));
  EXPECT_EQ("  R\"(\n a\n)\";\n  b", Expand("  @scope\n{\n    R\"(\n a\n)\";\n    b\n}"));
  EXPECT_EQ("[R\"(\n})\"]", Expand("@def r = [R\"(\n})\"]\nr"));
  EXPECT_EQ("yes a\\", Expand("@if (R\"a\\\" == \"a\\\\\") yes@@ @(R\"a\\\")"));
  EXPECT_EQ("t(4) : Expected digit (not ')') after decimal point (ie after reading '1.')",
            Expand("R\"(\n\n)\"\n@(1.)"));
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
