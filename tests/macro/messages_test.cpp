// Every failure of the macro layer: the whole message, and the file and line where the position is known.

#include "expand_fixture.h"
#include "message_of.h"
#include "platform/system.h"
#include "text/numbers.h"

namespace qrex {

using MessagesTest = ExpandTest;

TEST_F(MessagesTest, Cases) { AssertCases("macro/cases/messages.txt"); }

TEST_F(MessagesTest, DefinitionsOutsideOfAFile) {
  LSFrame frame(world);
  const std::string text = "@def+ m = 1";
  EXPECT_EQ("No filescope frame",
            MessageOf([&] { return ExpandToString(nullptr, frame, TextRange(std::string_view(text))); }));
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
