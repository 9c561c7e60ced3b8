#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class RemoteTest : public TranslateTest {
 protected:
  // An interface with a method of no parameters, one with all directions, one that only answers.
  std::string Declared(const std::string& kind) {
    return "$model Pos { bool y; };\nnamespace n\n{\n$interface+ " + kind + R"( J
{
    void none() const;
    void all([in] int32 a, [in] const string8& b, [out] string8& c, [inout] xvector<int8>& d, [copy] Pos* e);
    void back([out] int8& r);
};
}
)";
  }
};

TEST_F(RemoteTest, Faults) {
  const std::vector<ErrorCase> cases = {
      {"void f(int32 a);", 2, "[in] or [out] expected when read int32"},
      {"int32 f();", 2, "Return type vesk::int32 invalid - must be void"},
      {"int32 a;", 2, "Attributes currently not supported on IPC interfaces"},
  };
  AssertErrors(cases, "$interface ipc I {\n", " };");
}

}  // namespace
}  // namespace qrex
