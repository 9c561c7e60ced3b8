// $enum and $enum class: their text, their records, their faults.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class EnumsTest : public TranslateTest {};

TEST_F(EnumsTest, Values) {
  const auto valuesOf = [this](const std::string& entries) {
    const std::string header = TranslateHeader("$enum E { " + entries + " };").header;
    return header.substr(0, header.find("};"));
  };
  EXPECT_EQ("enum E : int\n{\n    a=0,\n    b=10,\n    c=11\n", valuesOf("a, b = 10, c"));
  EXPECT_EQ("enum E : int\n{\n    a=-2,\n    b=-1,\n    c=0\n", valuesOf("a = -2, b, c"));
  EXPECT_EQ("enum E : int\n{\n    a=-1,\n    b=0\n", valuesOf("a = 0xFFFFFFFF, b"));  // the low 32 bits
}

TEST_F(EnumsTest, ForwardDeclarations) {
  AssertHeader("$enum class A;\n$enum B;\n$enum B;\n", "class A;\n\nenum B : int;\n\nenum B : int;\n\n");
  AssertMessages({
      {"\n$enum+ class A;", "t.h(2) : warning W1017 : + on forward declaration of A deprecated\n"},
      {"$enum A;\n$enum A { a };", ""},
      {"$enum E : [ 1 ] { a };", "t.h(1) : warning W1001 : Non-reflected $enum E contains metadata\n"},
  });
}

TEST_F(EnumsTest, Errors) {
  AssertErrors({
      {"$struct S {\n$enum+ E { a }; };", 2, "'+' modifier not permitted on nested enum"},
      {"$struct E;\n$enum E;", 2, "$enum E conflicts with previous declaration of $struct E"},
      {"$enum class E;\n$enum E;", 2, "$enum E had 'class' modifier in an earlier declaration"},
      {"$enum E;\n$enum class E;", 2, "$enum E didn't have 'class' modifier in an earlier declaration"},
      {"$enum E { a };\n$enum E { a };", 2, "Repeated definition of $enum E"},
      {"$enum E <<\ncopy>> { a };", 2, "Unrecognised qualifier << copy >> on $enum E"},
      {"$enum E : 1", 1, "Expected [ after : when read 1"},
      {"$enum E { a,\ndefault b };", 2, "Default specifier only supported on $enum class"},
      {"$enum class E { default a,\ndefault b };", 2, "Repeated default specifier in $enum E"},
      {"$enum E { - };", 1, "Expected identifier after - when read }"},
  });
}

}  // namespace
}  // namespace qrex
