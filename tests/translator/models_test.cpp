#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using ModelsTest = TranslateTest;

TEST_F(ModelsTest, FaultsOfTheBlock) {
  AssertErrors({
      {"$model M {\nint32 a; $foo { } };", 2, "$dropped or $schema expected when read $foo"},
      {"$model M { int32 a;\n$dropped { } $evolve { } };", 2, "$schema expected when read $evolve"},
      {"$model M { int32 a; $dropped { }\n};", 2, "Expected $schema after } when read }"},
      {"$model M { int32 a; $schema { 1: +a }\n$foo { } };", 2, "$evolve expected when read $foo"},
      {"$model M { int32 a;\nstring8 a; };", 2, "Repeated field name a"},
      {"$model M { int32 a; $dropped {\nint32 a; } $schema { 1: +a } };", 2, "Repeated field name a"},
      {"$struct S { $int32 a; $model {\nint32 a; } };", 2, "Repeated field name a"},
      {"$model M {\nint32& a; };", 2, "References not permitted within models"},
      {"$model M {\nconst int32 a; };", 2, "const or volatile qualifiers not permitted within models"},
      {"$model M { int32 a;\nM b; };", 2, "Field b : $model M contains itself"},
      {"$model M;\n$model N { M m[]; };\n$model M { xmap<int32, N> n; };", 3, "Field n : $model M contains itself"},
      {"$struct S : model {\nDynArray<S> s; } { };", 2, "Field s : $struct S contains itself"},
      {"$struct S { $model { xmap<int8, S> s; } };\n$model M { S s[2]; };", 2, "Field s : $struct S contains itself"},
      {"$struct S;\n$model M { S s[]; };\n$struct S { $model { M m; } };\n$struct T : model M { };", 4,
       "Field s : $model M contains itself"},
  });
}

// What of its own kind a model may hold: where accessors end, nothing repeats.
TEST_F(ModelsTest, OfItsOwnKind) {
  const std::pair<std::string, std::string> kModels[] = {
      {"$model M { xvector<M> children; };", "    void CreateIntochildren(vesk::ssize_t _i,M const* _src"},
      {"$model M { int32 v; assignable<DynArray<M> > kids; };", "    void Setkids(vesk::DynArray<M> const& _v) {"},
      {"$model M { int32 v; $dropped { M old[]; } $schema { 1: +v +old 2: -old } };", "    vesk::int32 v;\n"},
      {"$struct S { $model { DynArray<S> kids; xmap<string8,S> named; } };",
       "    void SetkidsElement(vesk::ssize_t _k0,S const& _v) { kids[_k0] = _v; }\n"},
      {"$struct S { $model { DynArray<S> kids; } };\n$model M { S s; xvector<S> v; };", "void Sets(S const& _v) {"},
      {"$model M { int32 v; assignable<xvector<M> > kids; };\n$interface I { M a; };",
       "vesk::xvector<M> (__stdcall *Getakids)(void const* _self);\n"},
  };
  for (const auto& [text, expected] : kModels) {
    const std::string header = TranslateHeader(text).header;
    EXPECT_NE(header.find(expected), header.npos) << text << "\n" << header;
  }
}

TEST_F(ModelsTest, FaultsOfTheSchema) {
  const std::vector<ErrorCase> cases = {
      {"a: +a", 1, "Release number expected when read a"},
      {"1: +a\n1: +b", 2, "Unexpected release number 1 (must strictly increase)"},
      {"3000000000: +a", 1, "Unexpected release number -1294967296 (must strictly increase)"},
      {"1 +a", 1, "Expected : after 1 when read +"},
      {"1: +a\n2:", 2, "No schema changes specified"},
      {"1: +z", 1, "Field z not declared in the model"},
      {"1: +a\n2: +a", 2, "Field a already added in the schema"},
      {"1: -d", 1, "Field d can't be dropped from the schema until it has been added"},
      {"1: +a +d\n2: -a", 2, "Field a not declared as dropped"},
      {"1: +a +d\n2: -z", 2, "Field z not declared as dropped"},
      {"1: +a +d\n2: -d\n3: -d", 3, "Field d already dropped in the schema"},
      {"1: +a +d\n2: +b -d", 2,
       "Syntax error: unexpected '-' : note that dropped fields must appear before added fields within a "
       "schema"},
      {"1: +a +b\n", 2, "Field d never added in a schema"},
      {"1: +a +d\n2: -d", 2, "Field b never added in a schema"},
      {"1: +a +b +d\n", 2, "Field d never dropped in a schema"},
  };
  AssertErrors(cases, "$model M { int32 a; int32 b; $dropped { int32 d; } $schema { ", "} };");
  AssertErrors({{"$model M { int32 a; $schema {\n1: +a", 2, "Met EOS before read matching brace for $schema block"}});
}

TEST_F(ModelsTest, FaultsOfTheEvolution) {
  const std::vector<ErrorCase> cases = {
      {"5 { }", 1, "Expected field identifier after { when read 5"},
      {"z { }", 1, "Field z not declared in the model"},
      {"a { }", 1, "Can't initialise field a that appeared in the first schema"},
      {"c { c = 1; }\nc { c = 2; }", 2, "Repeated initialisation code for field c"},
      {"c(z) { }", 1, "Field z not declared in the model"},
      {"g(c) { }", 1, "Field c not available in the schema just before g was added"},
      {"c(e) { }", 1, "Field e not available in the schema just before c was added"},
      {"c(b;\na) { }", 1, "Syntax error in dependency arg list : ;"},
      {"e { e = 1; }\n", 2, "Redundant initialisation of field e"},
  };
  const std::string model =
      "$model M { int32 a; int32 c; int32 g; $dropped { int32 b; int32 e; } "
      "$schema { 1: +a +b 3: +g +e 4: -e 5: -b +c } $evolve { ";
  AssertErrors(cases, model, "} };");
  AssertErrors({{"\nc(b,", 2, "Met EOS in middle of arg list"},
                {"\nc { c = 1;", 2, "Met EOS before read matching brace for $evolve block"},
                {"\nc { c = 1; }", 2, "Met EOS before read matching brace for $evolve block"}},
               model);
  // An argument that goes in the very release of the field is at hand, and empty code is none.
  EXPECT_NE(TranslateHeader(model + "c(b) { } c(b) { c = b; } } };").header.find("struct M"), std::string::npos);
}

}  // namespace
}  // namespace qrex
