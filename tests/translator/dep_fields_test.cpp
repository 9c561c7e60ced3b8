// $dep and $indep fields, $evict and $visit blocks in class bodies.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using DepFieldsTest = TranslateTest;

TEST_F(DepFieldsTest, ShortBodies) {
  const auto bodyOf = [this](const std::string& definition) {
    return Section(Body("$dep int32 a = " + definition + "\n"), "void a_calc(vesk::int32& a) const\n{\n", "}\nmutable");
  };
  EXPECT_EQ("    a = f(x, y)\n", bodyOf("f(x, y) /* why */ ;"));
  EXPECT_EQ("    a = vesk::DollarNew(new X(1))->n + S::k\n", bodyOf("$new X(1)->n + $$::k;"));
  EXPECT_EQ("    a = this->GetThisAsFinalClass()->b;\n", bodyOf("{ a = $this->b; };"));
  EXPECT_EQ("    if (x) { a = 1; } // one\n", bodyOf("{ if (x) { a = 1; } // one\n };"));
}

TEST_F(DepFieldsTest, VisitingOfTheContainingObject) {
  const auto visitOf = [this](const std::string& head, const std::string& field) {
    return Section(Body(field, head), "VisitContainingObject(vesk::IObjectVisitor& _v) const\n    {\n", "    }\n");
  };
  const std::string self = "        S const* _self = CONST_ATTRIB_CAST(S,a);\n";
  EXPECT_EQ("", visitOf("$struct S", "$indep <<-visit>> int32 a;\n"));
  EXPECT_EQ(self + "        _v << _self->_a_;\n        _v << static_cast<const typename BC::FinalClass*>(_self);\n",
            visitOf("$mixin S", "$indep <<visit>> int32 a;\n"));
  EXPECT_EQ(self + "        _v << static_cast<const typename BC::FinalClass*>(_self);\n",
            visitOf("$mixin S", "$dep <<-visit>> int32 a = 1;\n"));
  EXPECT_EQ(self + "        _v << _self;\n", visitOf("$class S isa vesk::IObject", "$dep void a calc { };\n"));
}

// --- $evict, $visit

TEST_F(DepFieldsTest, Errors) {
  const std::vector<ErrorCase> cases = {
      {"$indep ^ int32 a; };", 2, "^ not permitted on $indep"},
      {"$dep <<async>> int32 a = 1; };", 2, "Unrecognised qualifier << async >> on $cache"},
      {"$indep 7; };", 2, "Syntax error"},
      {"$dep const 7; };", 2, "Type expected when read 7"},
      {"$indep void a; };", 2, "void not permitted on $indep"},
      {"$int32 a; $dep int32 a = 1; };", 2, "Redefinition of field a"},
      {"$model { int32 a; } $indep int32 a; };", 2, "Redefinition of field a"},
      {"$dep int32 a\ncalc { } again { } };", 3,
       "Expected 'evictable','evict','create','destroy','invalidate','visit' or 'calc' after } when read "
       "again"},
      {"$indep int32 a = 1; };", 2, "Expected 'create','destroy' or 'visit' after a when read ="},
      {"$indep int32 a calc { } };", 2, "'calc' can't be specified on $indep"},
      {"$indep int32 a invalidate { } };", 2, "'invalidate' can't be specified on $indep"},
      {"$dep int32 a create { }\n; };", 3, "calc section not specified"},
  };
  AssertErrors(cases, "$struct S {\n");
  for (const char* word : {"calc", "create", "destroy", "visit", "evictable", "evict", "invalidate"}) {
    const std::string section = std::string(word) + " { } ";
    AssertErrors({{section + section + "; };", 2, "'" + std::string(word) + "' already specified"}},
                 "$struct S {\n$dep int32 a ");
  }
}

}  // namespace
}  // namespace qrex
