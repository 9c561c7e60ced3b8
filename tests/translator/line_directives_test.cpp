// Texts with `#line`: what stands where, and where no directive may stand.

#include <gtest/gtest.h>

#include "text_cases.h"
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
    ReplaceAllInPlace(output, "#line ", "#");
    ReplaceAllInPlace(output, " \"tree/app/src/t.cpp\"", "");
    return output;
  }
};

TEST_F(LineDirectivesTest, LinesAreThoseOfTheSource) {
  for (const auto& [name, source, output] : TextCasesOf("translator/line_directives.txt")) {
    EXPECT_EQ(output, Of(source)) << name << "\n" << source;
  }
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
