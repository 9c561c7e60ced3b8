// $variant: the class, the operations behind it, the record; $polymorphic functions over variants.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using VariantsTest = TranslateTest;

TEST_F(VariantsTest, Serialisability) {
  const auto serialises = [this](const std::string& declarations) {
    const std::string header = TranslateHeader(declarations).header;
    return header.find("void V::Serialise(") != std::string::npos;
  };
  EXPECT_TRUE(serialises("$variant V { int32; void; };"));
  EXPECT_FALSE(serialises("$variant V { int32; int32* p; };"));
  EXPECT_FALSE(serialises("$variant V { { int32* p; } s; };"));
  EXPECT_TRUE(serialises("$variant V <<ar>> { int32* p; };"));
  EXPECT_FALSE(serialises("$variant V <<-ar>> { int32; };"));
  EXPECT_TRUE(serialises("$variant V; $variant V { *xvector<V> children; int32 leaf; };"));  // under test
  EXPECT_FALSE(serialises("$variant W <<-ar>> { int32; }; $variant V { W w; };"));
  EXPECT_FALSE(serialises("$variant W <<-ser>> { int32; }; $variant V { W w; };"));
  EXPECT_TRUE(serialises("$variant W <<ser -ar>> { int32; }; $variant V { W w; };"));
}

TEST_F(VariantsTest, Errors) {
  AssertErrors({
      {"$struct S {\n$variant+ V { int32; }; };", 2, "'+' modifier not permitted on nested variant"},
      {"$enum V;\n$variant V;", 2, "$variant V conflicts with previous declaration of $enum V"},
      {"$variant V { void; };\n$variant V { void; };", 2, "Repeated definition of $variant V"},
      {"$variant V <<\ndc>> { };", 2, "Unrecognised qualifier << dc >> on $variant V"},
      {"$variant V\nint32;", 2, "Expected { after V when read int32"},
      {"$variant V { default 1", 1, "Met EOS before read ';'"},
      {"$variant V { void;\nvoid; };", 2, "Variant V : anonymous type 'void' incompatible with a default value"},
      {"$variant V { default 1;\nvoid; };", 2, "Variant V : anonymous type 'void' incompatible with a default value"},
      {"$variant V { { int32 a } s; };", 1, "; expected after type definition when read }"},
      {"$variant V { int32 a }", 1, "; expected after type definition when read }"},
      {"$variant V {\n};", 2, "$variant V is empty"},
  });
}

// --- $polymorphic

const char kTwoVariants[] = "$variant A { int32; void n; };\n$variant B { string8 x; { bool f; } s; };\n";

TEST_F(VariantsTest, PolymorphicErrors) {
  AssertErrors({
      {"$variant A { int32; };\n$polymorphic void f([A a]) { }", 2,
       "; expected after definition of $function f when read {"},
      {"$variant A { int32; };\n$function void f([A a]);", 2, "'[' unexpected.  Polymorphic argument not allowed here"},
      {"$variant A { int32; };\n$polymorphic void f([A a);", 2, "Expected ] after a when read )"},
      {"$polymorphic void f([int32 a]);", 1, "Polymorphic argument a is not a defined $variant"},
      {"$variant A;\n$polymorphic void f([A a]);", 2, "Polymorphic argument a is not a defined $variant"},
  });
}

}  // namespace
}  // namespace qrex
