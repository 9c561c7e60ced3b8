// Kinds of declarations beyond the cases: variations of small parts of their texts, and what is told in libraries.

#include "text_cases.h"
#include "translator/translate_fixture.h"

namespace qrex {
namespace {

using KindsTest = TranslateTest;

// Where the rest of the text is as in other cases.
TEST_F(KindsTest, PartsOfTexts) {
  for (const auto& [name, declared, part] : TextCasesOf("translator/parts.txt")) {
    settings.compilableText = name.starts_with("compilable");
    const Generated generated = TranslateHeader(declared);
    const std::string text = Folded(name.ends_with("header") ? generated.header : generated.tail);
    EXPECT_NE(text.find(part), text.npos) << declared << "\n" << text;
  }
}

TEST_F(KindsTest, NeedTheRuntimesHeader) {
  for (const std::string text : {"$struct A { };", "$type int32;", "$var int32 v;", "$typedef int32 T;"}) {
    MakeWorld(TargetType::Application);
    EXPECT_EQ("t.h(2) : error : @import of IObject.h required", ErrorOf("t.h", "\n" + text)) << text;
  }
}

// A function may be declared in any number of files; its definition is found behind all of them.
TEST_F(KindsTest, DeclarationsInSeveralFiles) {
  for (const char* header : {"a.h", "b.h"}) Translate(header, "$function void f();\n");
  EXPECT_EQ("#include \"a.h\"\n#include \"b.h\"\nvoid f();\nvoid f() { }\nvoid g(f* a) { }\n",
            Translate("t.cpp",
                      "@import \"a.h\"\n@import \"b.h\"\n$function void f();\n$function void f() { }\n"
                      "$function void g(f* a) { }\n"));
}

TEST_F(KindsTest, InLibraries) {
  MakeWorld(TargetType::StaticLibrary);
  AssertMessages("$function void f() { }",
                 "t.cpp(1) : warning W1012 : $function f defined in library without prior declaration\n", "t.cpp");
  for (const char* text : {"$function void f(); $function void f() { }", "$function inline void f() { }"})
    AssertMessages(text, "", "t.cpp");
  AssertMessages("$function+ void f();",
                 "t.cpp(1) : warning W1008 : $function+ f doesn't appear in public header of library\n", "t.cpp");
  MakeWorld(TargetType::StaticLibrary);
  Translate("api/p.h",
            "@import \"Vesk/vxObject/IObject.h\"\n$function void f();\n$var int32 v;\n$typedef int32 T;\n"
            "$enum E { a };\n$variant V { int32; };\n$functor void F();\n");
  EXPECT_EQ(R"(app/api/p.h(2) : warning W1009 : $function f not exported in public header of library
app/api/p.h(3) : warning W1009 : $var v not exported in public header of library
app/api/p.h(4) : warning W1009 : $typedef T not exported in public header of library
app/api/p.h(5) : warning W1009 : $enum E not exported in public header of library
app/api/p.h(6) : warning W1009 : $variant V not exported in public header of library
app/api/p.h(7) : warning W1009 : $functor F not exported in public header of library
)",
            Messages());
}

TEST_F(KindsTest, SerialisabilityOfVariants) {
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

TEST_F(KindsTest, AttributesOfContainersInContainers) {
  const std::string slots = Section(TranslateHeader("$interface I { const xvector<xvector<int8> > x; };").header,
                                    "(__stdcall *GetxSize)(void const* _self);\n", "    };\n");
  EXPECT_EQ(slots,
            "        vesk::int32 (__stdcall *GetxElementSize)(void const* _self,vesk::int32 _k0);\n"
            "        vesk::int8 (__stdcall *GetxElementElement)(void const* _self,vesk::int32 _k0,vesk::int32 _k1);\n");
}

// Each diamond doubles what a function table embeds.
TEST_F(KindsTest, LadderOfDiamonds) {
  std::string text = "$interface A0 { }; $interface B0 { };\n";
  for (int i = 0; i < 30; ++i) {
    const std::string heading = ToString(i + 1) + " : A" + ToString(i) + ", B" + ToString(i) + " { }; ";
    text += "$interface A" + heading + "$interface B" + heading + "\n";
  }
  AssertError(text, 14, "Too many base interfaces of $interface A13");
}

// Functions are friends where they stand in a class, not where it is only called nested.
TEST_F(KindsTest, FriendsOfNestedClasses) {
  settings.compilableText = true;
  const std::string text = " S <<nested>> : model { int32 a; } { $void F() {} };";
  EXPECT_EQ(TranslateHeader("$struct" + text).header.find("friend"), std::string::npos);
  const std::string header = TranslateHeader("$struct Outer { $struct" + text + " };").header;
  EXPECT_NE(header.find("\nfriend inline void __stdcall F(S* _self) { _self->F(); }"), std::string::npos);
  EXPECT_NE(header.find("template<typename Archive> friend inline void Serialise(Archive& _ar,S const& _x)"),
            std::string::npos);
}

TEST_F(KindsTest, ShortBodies) {
  const auto bodyOf = [this](const std::string& definition) {
    return Section(Body("$dep int32 a = " + definition + "\n"), "void a_calc(vesk::int32& a) const\n{\n", "}\nmutable");
  };
  EXPECT_EQ("    a = f(x, y)\n", bodyOf("f(x, y) /* why */ ;"));
  EXPECT_EQ("    a = vesk::DollarNew(new X(1))->n + S::k\n", bodyOf("$new X(1)->n + $$::k;"));
  EXPECT_EQ("    a = this->GetThisAsFinalClass()->b;\n", bodyOf("{ a = $this->b; };"));
  EXPECT_EQ("    if (x) { a = 1; } // one\n", bodyOf("{ if (x) { a = 1; } // one\n };"));
}

TEST_F(KindsTest, VisitingOfTheContainingObject) {
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

TEST_F(KindsTest, SectionsOfNodesStandOnce) {
  for (const char* word : {"calc", "create", "destroy", "visit", "evictable", "evict", "invalidate"}) {
    const std::string section = std::string(word) + " { } ";
    AssertError("$struct S {\n$dep int32 a " + section + section + "; };", 2,
                "'" + std::string(word) + "' already specified");
  }
}

// An argument that goes in the very release of the field is at hand, and empty code is none.
TEST_F(KindsTest, EvolutionOfWhatGoes) {
  const std::string model =
      "$model M { int32 a; int32 c; $dropped { int32 b; } $schema { 1: +a +b 5: -b +c } $evolve { c(b) { } c(b) { c = "
      "b; } } };";
  EXPECT_NE(TranslateHeader(model).header.find("struct M"), std::string::npos);
}

}  // namespace
}  // namespace qrex
