#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using RemoteTest = TranslateTest;

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
