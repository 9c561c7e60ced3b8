#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using InterfacesTest = TranslateTest;

TEST_F(InterfacesTest, AttributesOfContainersInContainers) {
  const std::string slots = Section(TranslateHeader("$interface I { const xvector<xvector<int8> > x; };").header,
                                    "(__stdcall *GetxSize)(void const* _self);\n", "    };\n");
  EXPECT_EQ(slots,
            "        vesk::int32 (__stdcall *GetxElementSize)(void const* _self,vesk::int32 _k0);\n"
            "        vesk::int8 (__stdcall *GetxElementElement)(void const* _self,vesk::int32 _k0,vesk::int32 _k1);\n");
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
      {"$interface I : I { };", 1, "$interface I can't be its own base"},
      {"$model M { xvector<M> m; };\n$interface I { M a; };", 2, "Attribute a : $model M contains itself"},
  });
}

}  // namespace
}  // namespace qrex
