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

}  // namespace
}  // namespace qrex
