// Every failure of the macro layer: the whole message, and the file and line where the position is known.

#include <utility>

#include "expand_fixture.h"
#include "message_of.h"
#include "platform/system.h"
#include "text/numbers.h"

namespace qrex {

struct Failure {
  const char* input;
  const char* message;
};

class MessagesTest : public ExpandTest {
 protected:
  template <size_t N>
  void AssertFail(const Failure (&failures)[N]) {
    for (const Failure& failure : failures) EXPECT_EQ(failure.message, ExpandAfresh(failure.input)) << failure.input;
  }
};

TEST_F(MessagesTest, ImportsAndPaths) {
  AssertFail({
      {"@scope {\n@import \"a\" }", "t(2) : @import statement not allowed here"},
      {"@if (true) {@importpath \"a\"}", "t(1) : @importpath statement not allowed here"},
      {"@import a", "t(1) : Quoted string expected after 'import' when read a"},
      {"@importpath\n1", "t(2) : Quoted string expected after 'importpath' when read 1"},
      {"@import 'a'", "t(1) : Quoted string expected after 'import' when read 'a'"},
      {"@import", "t(1) : Quoted string expected after 'import' when read EOS"},
      {"@import \"none\"", "t(1) : Can't import file: none"},
      {"@import (1)", "t(1) : No implicit conversion from int64 to string\n    in @import(1)"},
      {"@relativepath x", "t(1) : ( expected after @relativepath when read x"},
      {"@relativepath(\"a\")", "t(1) : Comma expected in @relativepath directive when read )"},
      {"@relativepath(\"a\",\n\"b\",)", "t(2) : ) expected  in @relativepath directive when read ,"},
      {"@relativepath(1,\"b\")", "t(1) : No implicit conversion from int64 to string\n    in @relativepath(1)"},
  });
}

TEST_F(MessagesTest, Values) {
  AssertFail({
      {"@$1", "t(1) : Identifier expected after @let when read 1"},
      {"@$n 1", "t(1) : = expected in definition of macro n when read 1"},
      {"@$n = 'v'", "t(1) : Quoted string expected after $n definition when read 'v'"},
      {"@$n = (1)", "t(1) : No implicit conversion from int64 to string\n    in @$(1)"},
      {"@$a = \"$(b)\"\n@$b = \"$(a)\"\n\"$(a)\"", "t(3) : Cyclic reference in $(name) substitution"},
      {"@let 1", "t(1) : Identifier expected after @let when read 1"},
      {"@let x = 1", "t(1) : @let directive failed : there is no variable named x"},
      {"@def m = 1\n@let m = 2", "t(2) : @let directive failed : m is a macro declared using @def"},
      {"@let int 1", "t(1) : Identifier expected for macro name when read 1"},
      {"@let int x = 1\n@let bool x = true", "t(2) : Redefinition of variable x in this scope"},
      {"@let int x 1", "t(1) : = expected in definition of macro x when read 1"},
      {"@let int x := 1", "t(1) : @let directive failed: x := may only be used for string type"},
      {"@let int x = 1 2", "Read 2 in middle of expression"},
      {"@let int x = 3000000000", "No implicit conversion from value 3000000000 to int32"},
      {"@let char c = \"ab\"", "No implicit conversion from value ab to char"},
      {"@let int x = 1\n@let x = \"s\"",
       "No conversion from string to int64\n    when parsing expression '\"s\"' for @let directive"},
  });
}

TEST_F(MessagesTest, Definitions) {
  AssertFail({
      {"@def 1", "t(1) : Identifier expected for macro name when read 1"},
      {"@def int = 1", "t(1) : Identifier expected for macro name when read ="},
      {"@def m 1", "t(1) : = or ( expected for definition of macro m when read 1"},
      {"@def m(x)\n1", "t(2) : = expected in definition of macro m when read 1"},
      {"@def m(1)", "t(1) : Read 1 while trying to read argument for definition of macro m"},
      {"@def m(x, x) = 1", "t(1) : Repeated argument x in definition of macro m"},
      {"@def m(true) = 1", "t(1) : Invalid formal argument 'true' in definition of macro m"},
      {"@def m(x y) = 1",
       "t(1) : Comma or right parenthesis expected when read y\nwhile reading argument list for definition of macro m"},
      {"\n@exportdef m = 1", "t(2) : No parent frame"},
  });
  LSFrame frame(world);
  const std::string text = "@def+ m = 1";
  EXPECT_EQ("No filescope frame",
            MessageOf([&] { return ExpandToString(nullptr, frame, TextRange(std::string_view(text))); }));
}

TEST_F(MessagesTest, Calls) {
  AssertFail({
      {"@def m(x,y) = x\nm 1", "t(2) : ( expected to begin argument list for macro m(x,y) when read 1"},
      {"@def m(x,y) = x\nm(a)", "t(2) : Insufficient arguments provided for macro m(x,y)"},
      {"@def m(x,y) = x\nm(a,b,\nc)", "t(2) : Too many arguments provided for macro m(x,y)"},
      {"@def m(int x) = x\nm(\"s\")", "No conversion from string to int64\n    passing formal argument x to macro m"},
      {"@def m =\n{\n\n@fail(\"bad\")\n}\nm", "t(4) : bad\n    invoking macro m"},
      {"@def m(x, y) = @fail(\"bad\")\n@def n(z) = { m(1, z) }\n\nn([2,3])",
       "t(1) : bad\n    invoking macro m(x,y) with x=1, y=z\n    invoking macro n(z) with z=[2,3]"},
      {"@def int m = 1 / 0\nm", "Division by zero error\n    invoking macro m"},
      {"@def a(f()) = f 1\n@def g(x)=x\na(g)",
       "t(1) : ( expected to begin argument list for macro f when read 1\n    invoking macro a(f) with f=g"},
      {"@def a(f()) = f(1)\n@def g(x,y) = x\na(g)",
       "Insufficient arguments provided for macro g(x,y)\n    invoking macro a(f) with f=g"},
  });
}

TEST_F(MessagesTest, Conditions) {
  AssertFail({
      {"@if 1", "t(1) : ( expected when read 1"},
      {"@if (\n1)\n{}", "t(1) : No implicit conversion from int64 to bool\n    in @if(1)"},
      {"@if (true) {}\n@elseif (1) {}", "t(1) : No implicit conversion from int64 to bool\n    in @elseif(1)"},
      {"@if () {}", "t(1) : Unexpected ) after ( in expression\n    in @if()"},
      {"@def a = b\n@if (1 +\n a) {}", "t(2) : Unexpected b after + in expression\n    in @if(1 +\n b)"},
      {"@if (\n@fail(\"x\")) {}", "t(2) : x\n    in @if(@fail(\"x\"))"},
      {"@while (1) {}", "t(1) : No implicit conversion from int64 to bool\n    in @while(1)"},
      {"@def a = 1\n\n@assert(a == 2)", "t(3) : Assertion failure\n        @assert(a == 2)\nie      @assert(1 == 2)"},
      {"@assert(1)", "t(1) : No implicit conversion from int64 to bool\n    in @assert(1)"},
      {"@assertfails[ok]", "t(1) : Macro expansion of ok didn't generate an error"},
      {"@fail(\"a\" + \"b\")", "t(1) : ab"},
      {"@else {}", "t(1) : @else with no matching @if directive"},
      {"@fail(1)", "t(1) : No implicit conversion from int64 to string\n    in @fail(1)"},
  });
}

TEST_F(MessagesTest, Lists) {
  AssertFail({
      {"@for x", "t(1) : ( expected after @for when read x"},
      {"@for (1", "t(1) : Identifier expected after @for( when read 1"},
      {"@for ((1", "t(1) : Identifier expected when read 1"},
      {"@for ((a 1", "t(1) : , or ) expected when read 1"},
      {"@for (a of", "t(1) : 'in' expected when read of"},
      {"@for (a in\n 1) {}", "t(2) : [ expected when read read 1"},
      {"@for (a in [1) {}", "t(1) : Met EOS while reading argument 1\n    in @for directive for list [1"},
      {"@for ((a,b) in\n[(1,2,3)]) {}", "t(2) : ) expected when read ,"},
      {"@for (a in [`b`c]) {}", "t(1) : , or ] expected when read c"},
      {"@for (a in [1,2]) {@fail(\"no\")}", "t(1) : no\n    in @for directive when a = 1"},
      {"@for ((a,b) in [(1,2)]) {\n@fail(\"no\")}", "t(2) : no\n    in @for directive when  = (1,2)"},
      {"@for (a in [@quote(@fail(\"no\"))]) {a}",
       "no\n    invoking macro a\n    in @for directive when a = @fail(\"no\")"},
  });
}

TEST_F(MessagesTest, Expressions) {
  AssertFail({
      {"a\n\x01", "t(2) : Bad token \x01"},
      {"\n@print(@(\"\\xff\"))", "t(2) : String conversion failed"},
      {"\n@(1 2)", "t(2) : Expected ) after 1when read 2 in expression\n    in @(1 2)"},
      {"@(1 / 0)", "t(1) : Division by zero error\n    in @(1 / 0)"},
      {"@def n = m@@1\n@def m1(x) = x\n@[n]",
       "t(3) : ( expected to begin argument list for macro m1(x) when read ]\n    in @[m1]"},
      {"@unstr(x)", "t(1) : x isn't a quoted string\n    in @unstr(x)"},
      {"@unstr \"a\"", "t(1) : ( expected when read \"a\""},
  });
}

// --- Bounds

TEST_F(MessagesTest, SelfExpansionEnds) {
  std::string deep, crossed, nested;
  platform::RunOnStack(size_t{1} << 28, [&] {
    deep = Expand("@def f = f f\nf");
    crossed = Expand("@def a(x) = b(x)\n@def b(x) = @[a(x)]\na(1)");
    nested = Expand("@(" + std::string(5000, '(') + "1" + std::string(5000, ')') + ")");
  });
  const std::string tooDeep = "Macro expansion nested too deeply";
  EXPECT_EQ("t(1) : " + tooDeep + "\n    invoking macro f\n    invoking macro f\n", deep.substr(0, 83));
  EXPECT_NE(std::string::npos, crossed.find(tooDeep)) << crossed.substr(0, 100);
  EXPECT_EQ("t(1) : Expression nested too deeply\n    in @((((", nested.substr(0, 48));
}

TEST_F(MessagesTest, EndlessLoopEnds) {
  world.limits.iterations = 1000;
  EXPECT_EQ("1000", Expand("@let int i = 0\n@while (i < 1000) {@let i = i + 1\n}i"));
  EXPECT_EQ("t(1) : Too many iterations in @while directive", Expand("@while (true) {}"));
}

TEST_F(MessagesTest, MultiplyingMacrosEnd) {
  world.limits = {1000, 100000, 1000};
  std::string doubling = "@def a0 = \"0123456789\"\n";
  for (int i = 1; i < 20; ++i) {
    const std::string inner = "a" + std::to_string(i - 1);
    doubling += "@def a" + std::to_string(i) + " = " + inner + " " + inner + "\n";
  }
  EXPECT_NE(std::string::npos, Expand(doubling + "a19").find("Too many macro expansions"));
  world.limits.parts = ExpansionLimits().parts;
  EXPECT_NE(std::string::npos, Expand(doubling + "a19").find("Expanded text is too long"));

  world.limits.bytes = 10000;
  // What is alive counts: maps, which take more than the short runs they are of, and the texts that wait for another.
  const std::string text(6000, 'x');
  const std::string tooLong = "t(2) : Expanded text is too long";
  std::string runs = "@def a = x\n";
  for (int i = 0; i < 2000; ++i) runs += "a ";
  EXPECT_EQ(tooLong, Expand(runs).substr(0, tooLong.size()));
  EXPECT_EQ(tooLong, Expand("@def a = " + text + "\na @[a]").substr(0, tooLong.size()));
  EXPECT_EQ(tooLong, Expand("@def a = " + text + "\na @str(a)").substr(0, tooLong.size()));
}

TEST_F(MessagesTest, DeepBracketsAreNoNesting) {
  const std::string brackets = std::string(1000000, '(') + std::string(1000000, ')');
  EXPECT_EQ(brackets, Expand(brackets));
  EXPECT_EQ("<" + brackets + ">", Expand("@def f(x) = <x>\nf(" + brackets + ")"));
}

// Whatever the bytes are, an expansion or a message comes of them.
TEST_F(MessagesTest, JunkNeverCrashes) {
  static constexpr std::string_view kPieces =
      "@def m(x) = ;@def ;@nakeddef n(y()) = ;@if (;@for (x in [;@while (false);@let int i = ;@let i = ;@str(;@unstr(;"
      "@quote(;@[;@(;@scope;@assertfails(;@$v = ;\"$(v)\";m(;n(m);x;y(1);@exportdef e = ;@def+ p = ;@else "
      ";{;};(;);[;];,;"
      "\n;\n  ;`;true;1 + ;\"s\";@@;@//c\n;i;p e;\x80;';@elseif (";
  std::vector<std::string> pieces;
  SplitString(kPieces, pieces, ";");
  uint32_t state = 1;
  auto random = [&](size_t below) {
    state = state * 1664525 + 1013904223;
    return (state >> 8) % below;
  };
  size_t expanded = 0;
  for (int round = 0; round < 3000; ++round) {
    std::string text;
    for (size_t piece = random(25); piece > 0; --piece) text += pieces[random(pieces.size())];
    if (round % 50 == 0) text += static_cast<char>(random(256));
    const std::string result = ExpandAfresh(text);
    expanded += result.substr(0, 2) != "t(";
  }
  EXPECT_GT(expanded, 100u);
}

}  // namespace qrex
