#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using InterfacesTest = TranslateTest;

constexpr char kDiamond[] = R"($interface+ A { void a(int32 i); };
$interface+ K : A { int32 k() const; };
$interface+ L : A { };
$interface+ D : [ "doc" ] : K, L { void d(const string8& s, int32 n=3); int32 v; };
)";

TEST_F(InterfacesTest, AttributesBecomeMethods) {
  const struct {
    const char *attribute, *slots;
  } kAttributes[] = {
      {"const int32 x", "vesk::int32 (__stdcall *Getx)(void const* _self);\n"},
      {"ConstNumber x", "vesk::int32 (__stdcall *Getx)(void const* _self);\n"},
      {"Number x", "Number (__stdcall *Getx)(void const* _self);\nvoid (__stdcall *Setx)(void* _self,Number x);\n"},
      {"Plain x", ""},
      {"xmap<int32,bool> x",
       "vesk::xmap<vesk::int32,bool > (__stdcall *Getx)(void const* _self);\n"
       "void (__stdcall *Setx)(void* _self,vesk::xmap<vesk::int32,bool > x);\n"},
      {"const xvector<xvector<Number> > x",
       "vesk::int32 (__stdcall *GetxSize)(void const* _self);\n"
       "vesk::int32 (__stdcall *GetxElementSize)(void const* _self,vesk::int32 _k0);\n"
       "Number (__stdcall *GetxElementElement)(void const* _self,vesk::int32 _k0,vesk::int32 _k1);\n"},
      {"xvector<Pos> x",
       "vesk::int32 (__stdcall *GetxSize)(void const* _self);\n"
       "void (__stdcall *DeleteFromx)(void* _self,vesk::int32 i1,vesk::int32 i2);\n"
       "void (__stdcall *RecordExtractFromx)(void* _self,vesk::int32 si1,vesk::int32 si2,vesk::xvector<Pos>& dst,"
       "vesk::int32 di);\n"
       "void (__stdcall *InsertIntox)(void* _self,vesk::int32 di,vesk::xvector<Pos>& src,vesk::int32 si1,"
       "vesk::int32 si2);\n"
       "bool (__stdcall *GetxElementy)(void const* _self,vesk::int32 _k0);\n"
       "void (__stdcall *SetxElementy)(void* _self,vesk::int32 _k0,bool xElementy);\n"},
  };
  const std::string declared =
      "$typedef int32 Number;\n$typedef const int32 ConstNumber;\n$struct Plain { };\n$model Pos { bool y; };\n";
  for (const auto& [attribute, slots] : kAttributes) {
    std::string text = Section(TranslateHeader(declared + "$interface I { " + attribute + "; };\n").header,
                               "struct I\n{\n    struct FnTable\n    {\n", "    };\n");
    for (size_t indent; (indent = text.find("        ")) != text.npos;) text.erase(indent, 8);
    EXPECT_EQ(text, slots) << attribute;
  }
  // What is noted of the attribute is noted of what its method answers.
  EXPECT_EQ(Section(TranslateHeader("$interface+ I { const int32 : [ 7 ] x; };\n").tail, "I_Getx_return[] =\n", ";"),
            "        {\n            0x04\n        }");
  EXPECT_EQ(Section(TranslateHeader("$interface+ I { int32 : [ 7 ] x; };\n").tail, "I_Setx_x[] =\n", ";"),
            "        {\n            0xe1,0xa2,0x07,0x00,0x00,0x00,0x04\n        }");
}

TEST_F(InterfacesTest, Warnings) {
  TranslateHeader(R"($interface U { };
$interface+ A : vesk::IObject { };
$interface B << -register >> : U { };
$interface+ C : U, A { };
$interface D : A { };
)");
  EXPECT_EQ(Messages(),
            "t.h(4) : warning W1004 : $interface B is not reflected and has redundant << >> directives\n"
            "t.h(5) : warning W1006 : Inconsistent subtyping of IObject in base interfaces\n"
            "    $interface U doesn't subtype IObject\n"
            "    $interface+ A subtypes IObject\n"
            "t.h(2) : see declaration of $interface U\n"
            "t.h(3) : see declaration of $interface+ A\n"
            "t.h(5) : warning W1002 : Reflected $interface+ C references non-registered $interface U\n"
            "t.h(2) : see declaration of $interface U\n"
            "t.h(6) : warning W1007 : $interface D subtypes IObject but isn't reflected\n");
}

// Each diamond doubles what a function table embeds.
TEST_F(InterfacesTest, LadderOfDiamonds) {
  std::string text = "$interface A0 { }; $interface B0 { };\n";
  for (int i = 0; i < 30; ++i) {
    const std::string heading = ToString(i + 1) + " : A" + ToString(i) + ", B" + ToString(i) + " { }; ";
    text += "$interface A" + heading + "$interface B" + heading + "\n";
  }
  AssertErrors({{text, 14, "Too many base interfaces of $interface A13"}});
}

TEST_F(InterfacesTest, Faults) {
  AssertErrors({
      {"$class C {\n$interface+ I { }; };", 2, "'+' modifier not permitted on nested interface"},
      {"$class C {\n$interface ipc I { }; };", 2, "'ipc' modifier not permitted on nested interface"},
      {"$class C {\n$interface rmi I { }; };", 2, "'rmi' modifier not permitted on nested interface"},
      {"$struct I { };\n$interface I { };", 2, "$interface I conflicts with previous declaration of $struct I"},
      {"$interface I { };\n$interface I { };", 2, "Repeated definition of $interface I"},
      {"$interface I << abstract >> { };", 1, "Unrecognised qualifier << abstract >> on $interface I"},
      {"$interface I : { };", 1, "Expected identifier after : when read {"},
      {"$struct S { };\n$interface I : S { };", 2, "Base interface name expected when read $struct S"},
      {"$interface J { };\n$interface I : J J { };", 2, "Expected , or { after J when read J"},
      {"$interface I : I { };", 1, "$interface I can't be its own base"},
      {"$interface I [ ] { };", 1, "Expected { after I when read ["},
      {"$interface I {\nvoid f() }; ", 2, "Expected ; after ) when read }"},
      {"$model M { xvector<M> m; };\n$interface I { M a; };", 2, "Attribute a : $model M contains itself"},
  });
}

}  // namespace
}  // namespace qrex
