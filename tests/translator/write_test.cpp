#include <gtest/gtest.h>

#include "translator/emit/emit.h"

namespace qrex {
namespace {

template <typename Emit>
std::string Emitted(Emit emit) {
  MemoryTextWriter out;
  emit(out);
  return out.TakeText();
}

TEST(WriteTest, HolesWithinLines) {
  const std::string name = "K";
  EXPECT_EQ(Emitted([&](TextWriter& out) { Write(out, "$a$$b$,$a$;", "a"_ = name, "b"_ = 'x'); }), "Kx,K;");
  EXPECT_EQ(Emitted([&](TextWriter& out) { Write(out, "no hole\n"); }), "no hole\n");
  EXPECT_EQ(Emitted([&](TextWriter& out) {
              Write(out, "f($arguments$)", "arguments"_ = Each(out, std::vector{1, 2}, ",", [&](int i) { out << i; }));
            }),
            "f(1,2)");
}

TEST(WriteTest, HolesOfSeveralTexts) {
  const auto text = Emitted([](TextWriter& out) {
    std::string name = "K";
    const auto vars = WithVars(out, "name"_ = name, "type"_ = std::string("int"), "word"_ = "static");
    name = "L";  // each text has what was given
    vars.Write("$word$ $type$ $name$;\n");
    vars.Write(R"(
      $name$ $value$
          $lines$
    )",
               "value"_ = 1, "lines"_([&] { out << "a\nb\n"; }));
  });
  EXPECT_EQ(text, "static int K;\nK 1\n    a\n    b\n");
}

TEST(WriteTest, LinesAndMargins) {
  const auto text = Emitted([](TextWriter& out) {
    const Block block(out);
    Write(out, R"(
      struct $name$
      {
          $fields$
          $nothing$

          bool f() { return true$more$; }
      };
    )",
          "name"_ = "K", "fields"_([&] { out << "int a;\nint b;\n"; }), "nothing"_ = "", "more"_ = "\n&& a\n&& b");
  });
  EXPECT_EQ(text,
            "{\n"
            "    struct K\n"
            "    {\n"
            "        int a;\n"
            "        int b;\n"
            "        \n"
            "        bool f() { return true\n"
            "        && a\n"
            "        && b; }\n"
            "    };\n"
            "}\n");
}

TEST(WriteTest, UnderConditions) {
  const auto text = Emitted([](TextWriter& out) {
    const auto line = [&] { out << "line\n"; };
    const std::string word = "word";
    Write(out, R"(

      f($no$$yes$);
          $noLine$
          $yesLine$
          $noText$
          $yesText$
    )",
          "no"_ = If(false, word), "yes"_ = If(true, word), "noLine"_ = If(false, line), "yesLine"_ = If(true, line),
          "noText"_ = If(false, "text"), "yesText"_ = If(true, "text"));
  });
  EXPECT_EQ(text, "\nf(word);\n    line\n    text\n");
}

TEST(WriteTest, FurtherLinesWithinALine) {
  const auto text = Emitted([](TextWriter& out) {
    const auto twoLines = [&] { out << "map<int,\nint>"; };
    Write(out, R"(
      {
          f($first$) { g($second$); }
      }
    )",
          "first"_ = twoLines, "second"_ = "h(),\nk()\n");
    const Block block(out);
    out << "int a;\n";
  });
  EXPECT_EQ(text,
            "{\n"
            "    f(map<int,\n"
            "    int>) { g(h(),\n"
            "    k()\n"
            "    ); }\n"
            "}\n"
            "{\n"
            "    int a;\n"
            "}\n");
}

}  // namespace
}  // namespace qrex
