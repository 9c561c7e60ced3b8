#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using MixinsTest = TranslateTest;

TEST_F(MixinsTest, Implementing) {
  const std::string declared =
      "$interface+ I : vesk::IObject { int32 f(int32 a=1) const; void g(); };\n$adt A { void h(string8 s); };\n";
  EXPECT_EQ(Section(TranslateHeader(declared + "$class K isa I { $implementing I { g f }, adt A; };\n").header,
                    " BaseClass;\n", "\npublic"),
            " void g();\nvesk::int32 f(vesk::int32 a=1) const;\nvoid h(vesk::string8 s);\n ");
  EXPECT_EQ(Messages(), "");
  EXPECT_EQ(Section(TranslateHeader(declared + "$class K { $implementing I; };\n").header, "class K\n{", "\npublic"),
            " vesk::int32 f(vesk::int32 a=1) const;\nvoid g();\n ");
  EXPECT_EQ(Messages(),
            "t.h(4) : warning W1014 : $class K implementing $interface+ I without associated 'isa'\n"
            "t.h(2) : see declaration of $interface+ I\n");
}

TEST_F(MixinsTest, Faults) {
  AssertErrors({
      {"$class C { };\n$class K : mixin [ C ] { };", 2, "$class C is not a $mixin or $model"},
      {"$interface I { };\n$class K : mixin [\nI\n] { };", 3, "$interface I is not a $class or $struct"},
      {"$class K : mixin [ X ] { };", 1, "Unrecognised identifier : X"},
      {"$mixin M { };\n$class K : mixin [ M, M ] { };", 2, "Expected identifier after M when read ,"},
      {"$class K : mixin [ ? a::\n5 ] { };", 2, "Expected identifier after a:: when read 5"},
      {"$class K : mixin [\nmodel\n+ ] { };", 2, "Expected { after 'model' when read +"},
      {"$class K { $implementing K; };", 1, "$interface identifier expected when read $class K"},
      {"$interface I { };\n$class K { $implementing\nadt I; };", 3, "$adt identifier expected when read $interface I"},
      {"$interface I { };\n$class K { $implementing I -f; };", 2, "- not supported"},
      {"$interface I { void f(); };\n$class K { $implementing I { f\ng }; };", 3, "$interface I has no method named g"},
  });
}

// Functions are friends where they stand in a class, not where it is only called nested.
TEST_F(MixinsTest, FriendsOfNestedClasses) {
  settings.compilableText = true;
  const std::string text = " S <<nested>> : model { int32 a; } { $void F() {} };";
  EXPECT_EQ(TranslateHeader("$struct" + text).header.find("friend"), std::string::npos);
  const std::string header = TranslateHeader("$struct Outer { $struct" + text + " };").header;
  EXPECT_NE(header.find("\nfriend inline void __stdcall F(S* _self) { _self->F(); }"), std::string::npos);
  EXPECT_NE(header.find("template<typename Archive> friend inline void Serialise(Archive& _ar,S const& _x)"),
            std::string::npos);
}

}  // namespace
}  // namespace qrex
