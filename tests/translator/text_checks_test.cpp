// Declarations whose text can't compile, or loses something.
#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class TextChecksTest : public TranslateTest {
 protected:
  // What is printed beside the W1002 of things that nobody registers.
  void AssertWarned(const std::string& text, const std::string& warning) {
    AssertMessages("$warning(disable: 1002 1007)\n" + text, warning);
  }
};

TEST_F(TextChecksTest, AModelThatHidesAnotherFarBelow) {
  settings.compilableText = true;
  const std::string models = "$mixin M : model { int32 a; } { };\n$model Own { int32 b; };\n";
  const std::string warning =
      "t.h(4) : warning W1019 : $struct S archives and prints the model of $mixin M in place of its own: write one "
      "model that has the fields of both\n";
  std::string ladder = models + "$mixin L0 : mixin [ M ] { };";
  for (int step = 0; step < 60; ++step) {
    const std::string below = std::to_string(step);
    ladder += "$mixin L" + std::to_string(step + 1) + " : mixin [ L" + below + " L" + below + " ] { };";
  }
  AssertWarned(ladder + " $struct S : model Own mixin [ L60 ] { };", warning);
}

TEST_F(TextChecksTest, AReleaseBehindThatOfAModel) {
  const std::string model =
      "@import \"Vesk/vxObject/IObject.h\"\nnamespace n { $model M { int32 a; int32 b; $schema { 1: +a 4: +b } }; }\n";
  const auto warning = [&](const std::string& definition) {
    MakeWorld(TargetType::Application);
    AddFile("m.h", model);
    AddFile("t.cpp", "@import \"m.h\"\n" + definition);
    Translate("t.cpp");
    return Messages();
  };
  EXPECT_EQ("", warning("vxDefineTargetFunctions(app, 3)"));
  settings.compilableText = true;
  EXPECT_EQ(
      "t.cpp(2) : warning W1020 : The target of the project writes archives of release 3, but $model n::M has release "
      "4: nothing could read them, define the target with 4\n",
      warning("vxDefineTargetFunctions(app, 3)"));
  for (const char* definition :
       {"vxDefineTargetFunctions(app, 4)", "vxDefineTargetFunctions(other, 3)", "vxDefineTargetFunctions(app, RELEASE)",
        "int vxDefineTargetFunctions;", "$warning(disable: 1020) vxDefineTargetFunctions(app, 3)"}) {
    EXPECT_EQ("", warning(definition)) << definition;
  }
}

TEST_F(TextChecksTest, NumbersOfTheKey) {
  const std::string text = "$warning(disable: 1018 1019)\n$class K { $void F() {} };";
  EXPECT_EQ(ErrorOf("t.h", text), "t.h(1) : error : Invalid warning code : 1018");
  settings.compilableText = true;
  AssertWarned(text, "");
}

}  // namespace
}  // namespace qrex
