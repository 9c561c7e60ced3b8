// Texts with `#line`: what stands where, and where no directive may stand.

#include <gtest/gtest.h>

#include "translate_fixture.h"

namespace qrex {
namespace {

class LineDirectivesTest : public TranslateTest {
 protected:
  LineDirectivesTest() { settings.lineDirectives = settings.modernCpp = true; }

  // Of a source, without the registration of the project and with `#N` for a directive of its own.
  std::string Of(const std::string& text) {
    MakeWorld(App().targetType);
    std::string output = Translate("t.cpp", text);
    Replace(output, "#line ", "#");
    Replace(output, " \"tree/app/src/t.cpp\"", "");
    return output;
  }
  static void Replace(std::string& text, const std::string& what, const std::string& by) {
    for (size_t at = 0; (at = text.find(what, at)) != text.npos; at += by.size()) text.replace(at, what.size(), by);
  }
};

struct LineCase {
  const char* source;
  const char* output;
};

TEST_F(LineDirectivesTest, LinesAreThoseOfTheSource) {
  const LineCase kCases[] = {
      {"int a;\n\n// b\nint c;\n", "#1\nint a;\n\n// b\nint c;\n"},
      // A few lines that gave nothing are empty ones, more are passed over.
      {"int a;\n$warning(push);\n\n$warning(pop);\nint b;\n", "#1\nint a;\n;\n\n;\nint b;\n"},
      {"int a;\n@def M = {\n\n\n\n\n\n\n\n\n}\nint b;\n", "#1\nint a;\n#12\nint b;\n"},
      // What a call gives stands on its line, but for what ends a line.
      {"@def M =\n{\n  int a;\n  int b;\n}\nM int c;\nint d;\n", "#6\nint a; int b; int c;\nint d;\n"},
      {"@def M =\n{\n#if A\nint a; // a\nint b;\n#endif\n}\nM\nint d;\n",
       "#8\n#if A\n#8\nint a; // a\n#8\nint b;\n#8\n#endif\n#9\nint d;\n"},
      {"@def M =\n{\n#define X 1 \\\n  2\n}\nM\nint d;\n", "#6\n#define X 1 \\\n  2\n#7\nint d;\n"},
      {"@def M =\n{\nR\"x(\n)\"\n\n)x\"\n}\nM\nint d;\n", "#8\nR\"x(\n)\"\n\n)x\"\n#9\nint d;\n"},
      {"@def M =\n{\n/* '\n\" ( */ int a = 1'000;\nchar b = '(';\n}\nM\nint d;\n",
       "#7\n/* '\n\" ( */\n#7\n int a = 1'000; char b = '(';\nint d;\n"},
      // Among arguments there are no directives, whatever the branches of a condition leave open.
      {"@def M =\n{\n1,\n#if 1\n2,\n#endif\n}\nint a = f(\nM\n3);\nint b;\n",
       "#8\nint a = f(\n1,\n#if 1\n2,\n#endif\n3);\n#11\nint b;\n"},
      {"#if A\nint a = f(\n#else\nint a = g(\n#endif\n1);\n@def M = {\n\n\n\n\n\n\n\n\n\n}\nint b;\n",
       "#1\n#if A\nint a = f(\n#else\nint a = g(\n#endif\n1);\n#18\nint b;\n"},
      // A source that was generated itself.
      {"int a;\n#line 7 \"t.y\"\nint b;\n@def M = {\n\n\n\n\n\n\n\n\n\n}\nint c;\n",
       "#1\nint a;\n#7 \"t.y\"\n#7 \"t.y\"\nint b;\n#19 \"t.y\"\nint c;\n"},
  };
  for (const LineCase& row : kCases) ASSERT_EQ(row.output, Of(row.source)) << row.source;
}

// A body keeps its lines, and what stands behind it is not among them; a byte of a mark in a source is none.
TEST_F(LineDirectivesTest, BodiesHaveTheirLines) {
  MakeWorld(App().targetType);
  AddFile("t.h",
          "@import \"Vesk/vxObject/IObject.h\"\n$struct S {\n$dep int32 a =\n{\n  a = 1;\n\n  a += '\x01"
          "1';\n};\n"
          "int end;\n};\n");
  const std::string output = Translate("t.h");
  const std::string body = Section(output, "void a_calc(", "int end;");
  ASSERT_NE(body.npos, body.find("\n\n    a = 1;\n    \n      a += '\x01"
                                 "1';\n} "))
      << output;
  ASSERT_EQ(body.npos, body.find("#line")) << output;
}

TEST_F(LineDirectivesTest, RecordsPointAtTheirDeclarations) {
  MakeWorld(App().targetType);
  AddFile("t.h", "@import \"Vesk/vxObject/IObject.h\"\n\n$enum+ A { a1 };\n\n$enum+ B { b1 };\n");
  AddFile("t.cpp", "@import \"t.h\"\n");
  Translate("t.h");
  const std::string output = Translate("t.cpp");
  const size_t a = output.find("#line 3 \"tree/app/src/t.h\"\n"), b = output.find("A_", a);
  ASSERT_LT(a, b) << output;
  ASSERT_LT(b, output.find("_Register_B")) << output;
}

}  // namespace
}  // namespace qrex
