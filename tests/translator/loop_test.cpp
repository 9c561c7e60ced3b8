// The main loop: what is copied, what head, foot and line table look like, and the directives that belong to no kind.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class LoopTest : public TranslateTest {};

TEST_F(LoopTest, CopiesPlainText) {
  const std::string text = "// a comment\n\n#include <vector>\nint f() { return 1; /* } */ }\n\tusing namespace std;\n";
  EXPECT_EQ(text, Translate("a.cpp", text));
}

TEST_F(LoopTest, ErrorsOfDirectives) {
  AssertErrors({
      {"\n}", "(2) : error : Can't match }"},
      {"$bogus x;", "(1) : error : '$bogus' is not a valid directive"},
  });
}

}  // namespace
}  // namespace qrex
