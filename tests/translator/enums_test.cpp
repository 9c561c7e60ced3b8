// $enum and $enum class: their text, their records, their faults.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class EnumsTest : public TranslateTest {};

TEST_F(EnumsTest, ClassWithEveryPart) {
  MakeWorld(TargetType::DynamicLinkLibrary);
  AssertGenerated(
      "$enum+ class Level : [ \"doc\" ] { low, default -mid, high = 8 + 2, top, };\n",
      Golden("enums_class_with_every_part") + TraitsText("Level", "enum", "1111") + "} // namespace vesk\n\n",
      TailText("$enum+ Level", R"(    app_API vesk::ReflectedEnum const& _GetReflected(Level const*)
    {
        static const vesk::octet_t Level_metadata[] = { 0xe1,0xa4,0x00,0x00 };
        static vesk::ConstStringZ Level_stringTable[] = { "doc", };
        static const vesk::ReflectedEnum Level_enum =
        {
            "Level",
            Level_metadata,
            Level_stringTable,
            4,
            Level::stringArray(),
            Level::valueArray(),
            Level::enabledArray()
        };
        return Level_enum;
    }
)") + RegistrationText("$enum+ Level", "Enum"));
}

TEST_F(EnumsTest, PlainReflectedButNotRegistered) {
  AssertGenerated("$enum E <<reflect>> { a, -b = 7 };\n", R"(enum E : int
{
    a=0,
    b=7
};
vesk::ReflectedEnum const& _GetReflected(E const*);
inline vesk::TypeOps const& _GetTypeOps(E const*) { return vesk::GetTypeOps<vesk::int32>(); }
template<typename Archive> inline void Serialise(Archive& _ar,E _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
template<typename Archive> inline void Deserialise(Archive& _ar,E& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }

)" + TraitsText("E", "enum", "0100") + "} // namespace vesk\n\n",
                  TailText("$enum E", R"(    vesk::ReflectedEnum const& _GetReflected(E const*)
    {
        static vesk::ConstStringZ E_strings[] = { "a", "b", };
        static const vesk::int32 E_values[] = { 0, 7, };
        static const bool E_enabled[] = { true, false, };
        static const vesk::ReflectedEnum E_enum =
        {
            "E",
            0,
            0,
            2,
            E_strings,
            E_values,
            E_enabled
        };
        return E_enum;
    }
)"));
}

TEST_F(EnumsTest, WithoutLabels) {
  const Generated generated = TranslateHeader("$enum class C { };\n$enum+ P <<-register extern>> { };\n");
  EXPECT_EQ("    {\n    };\n    C(Enum _v) : EnumBase(_v) {}\n    explicit C(int _v = 0) : EnumBase(_v) {}\n",
            Section(generated.header, "enum Enum : int\n", "    enum { LEN = 0 };\n"));
  EXPECT_EQ("\nvesk::ReflectedEnum const& _GetReflected(P const*);\ninline vesk::TypeOps const& _GetTypeOps(P const*)",
            Section(generated.header, "} // namespace vesk\n", " {"));
  EXPECT_EQ("            0,\n            0,\n            0,\n            0,\n            0,\n            0\n",
            Section(generated.tail, "            \"P\",\n", "        };\n"));
}

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
      {"$enum E\n( a );", 2, "Expected { after E when read ("},
      {"$enum E { a,\ndefault b };", 2, "Default specifier only supported on $enum class"},
      {"$enum class E { default a,\ndefault b };", 2, "Repeated default specifier in $enum E"},
      {"$enum E { - };", 1, "Expected identifier after - when read }"},
      {"$enum E { a b };", 1, "Expected , or } after a when read b"},
      {"$enum E { a", 1, "Expected , or } after a when read EOS"},
      {"$enum E { a }\nint x;", 2, "; expected after definition of $enum E when read int"},
  });
}

}  // namespace
}  // namespace qrex
