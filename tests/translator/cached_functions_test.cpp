// $cache: functions whose results are kept in nodes, one per function or one per key.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using CachedFunctionsTest = TranslateTest;

TEST_F(CachedFunctionsTest, Errors) {
  const std::vector<ErrorCase> cases = {
      {"<<fast>> int32 f() const { } };", 2, "Unrecognised qualifier << fast >> on $cache"},
      {"<<queue(8)>> int32 f() const { } };", 2, "Eviction queue index 8 must be between 0 and 7"},
      {"<<-queue(-1)>> int32 f() const { } };", 2, "Eviction queue index -1 must be between 0 and 7"},
      {"<<queue 1>> int32 f() const { } };", 2, "Expected ( after queue when read 1"},
      {"int32 f()\n{ } };", 3, "$cache function must be declared const"},
      {"void f() const { } };", 2, "$cache function missing output type"},
      {"void f(int32 a) const { } };", 2, "$cache function missing output type"},
      {"void f(const int32& a) const { } };", 2, "$cache function missing output type"},
      {"int32 f() const with int32 i { } { } };", 2, "'with' only allowed on async $cache function"},
      {"<<async>> int32 f() const with int32 { } { } };", 2, "Error parsing input type and name"},
      {"<<async>> int32 f() const with int32 i() { } };", 2, "Error parsing input type and name"},
      {"<<async>> int32 f() const with 7 { } };", 2, "Error parsing input type and name"},
      {"<<async>> int32 f() const with const 7 { } };", 2, "Error parsing input type and name"},
      {"int32 f([int32 a]) const { } };", 2, "'[' unexpected.  Polymorphic argument not allowed here"},
  };
  AssertErrors(cases, "$struct S {\n$cache ");
}

}  // namespace
}  // namespace qrex
