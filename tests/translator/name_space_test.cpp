// Look-up over the file and its imports, conflicts, and the numbered warnings.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class NameSpaceTest : public TranslateTest {
 protected:
  // Translates a new .cpp with the import of IObject.h on its first line: "" or what it fails with.
  std::string Fault(const std::string& text) {
    std::string name = "t.cpp";
    for (int i = 2; builder->FindFile(PathOf(name)); ++i) name = "t" + std::to_string(i) + ".cpp";
    std::string error = ErrorOf(name, "@import \"Vesk/vxObject/IObject.h\" " + text);
    ReplaceAllInPlace(error, name, "t.cpp");
    return error.compare(0, 8, "no error") == 0 ? "" : error;
  }
  void AddHeader(const std::string& name, const std::string& text) {
    AddFile(name, "@import \"Vesk/vxObject/IObject.h\" " + text);
  }
};

using LookUp = NameSpaceTest;

TEST_F(LookUp, CurrentNameSpaceThenRoot) {
  const std::string names = "$struct R { }; namespace a { $struct A { }; namespace b { $struct B { }; } }\n";
  for (const std::string use : {"$type+ R;", "namespace a { namespace b { $type+ R; $type+ B; $type+ a::A; } }",
                                "namespace a { $type+ A; $type+ b::B; $type+ ::R; $type+ a::b::B; }"}) {
    EXPECT_EQ("", Fault(names + use)) << use;
    MakeWorld(TargetType::Application);
  }
}

// The head of a definition, and the names that lead to what it holds; one brace closes all of them.
TEST_F(LookUp, HeadsOfNameSpaces) {
  settings.modernCpp = true;
  static constexpr struct {
    std::string_view head, path;
  } kHeads[] = {
      {"namespace a::b::inline c", "a::b::c::"},
      {"inline namespace a", "a::"},
      {"namespace [[deprecated(\"x\")]] a::b", "a::b::"},
      {"namespace std _GLIBCXX_VISIBILITY(default)", "std::"},
      {"namespace EXPORT a __attribute__((visibility(\"default\")))", "a::"},
      {"namespace a EXPORT", "a::"},
      {"namespace A", "A::"},
  };
  for (const auto& [head, path] : kHeads) {
    const std::string text = std::string(head) + " { $struct S { }; }\n";
    EXPECT_EQ("", Fault(text + "$struct T { }; $type+ ::T; $type+ " + std::string(path) + "S;")) << head;
    MakeWorld(TargetType::Application);
  }
}

// Text that stands outside leaves as many braces as it found.
TEST_F(LookUp, TextOutsideOfNameSpaces) {
  settings.modernCpp = true;
  const std::string head = "namespace a::inline b { namespace c { ", text = "$enum+ E { x };";
  const std::string header = TranslateHeader(head + text + " } }\ninline namespace d { " + text + " }\n").header;
  for (const char* piece :
       {"\n} //c\n} //a\n", "\nnamespace a::inline b\n{\nnamespace c\n{\n", "\n} //d\n", "\ninline namespace d\n{\n"}) {
    EXPECT_NE(std::string::npos, header.find(piece)) << piece << header;
  }
  EXPECT_EQ(std::count(header.begin(), header.end(), '{'), std::count(header.begin(), header.end(), '}')) << header;
}

// Without the key there are two forms, wherever the word stands; what no key makes C++ is an error with it, too.
TEST_F(LookUp, FormsThatAreErrors) {
  EXPECT_EQ("", Fault("#define OPEN namespace x {\n$struct S { }; $type+ x::S; }"));
  for (const bool isModern : {false, true}) {
    settings.modernCpp = isModern;
    AssertError("namespace ;", 1, "Expected identifier after namespace when read ;");
    AssertError("\nnamespace 5 { }", 2, "Expected identifier after namespace when read 5");
    AssertError("int a;\nnamespace", 2, "Expected identifier after namespace when read EOS");
  }
}

// Each of them took a second or more where the text behind was read for each.
TEST_F(LookUp, ManyHeadsThatAreNone) {
  settings.modernCpp = true;
  for (const std::string word : {"namespace x ", "namespace [x\n", "namespace x(\n"}) {
    std::string text = word;
    while (text.size() < 1000000) text += text;
    const auto begin = std::chrono::steady_clock::now();
    EXPECT_EQ(text, Translate("t.cpp", text).substr(0, text.size()));
    EXPECT_LT(std::chrono::steady_clock::now() - begin, std::chrono::seconds(20)) << word;
    MakeWorld(TargetType::Application);
  }
}

TEST_F(LookUp, NamespaceInPlainText) {
  settings.modernCpp = true;
  for (const std::string text :
       {"namespace fs = std::filesystem;\n", "namespace fs = ::std::filesystem; int f() { return 1; }\n",
        "#include <boost/namespace.hpp>\n", "int x = F(namespace);\n", "namespace M(x)\n", "namespace M(x) ;\n",
        "#define OPEN namespace x {\n#define CLOSE }\n",
        "  # define OPEN(a, b) \\\n  namespace a##b {\n#define CLOSE }\n", "namespace a::b = c;\n"}) {
    EXPECT_EQ(text, Translate("t.cpp", text).substr(0, text.size())) << text;
    MakeWorld(TargetType::Application);
    EXPECT_EQ("", Fault("\n" + text + "$struct S { }; $type+ ::S;")) << text;
    MakeWorld(TargetType::Application);
  }
}

TEST_F(LookUp, ImportsAreSeenThroughImports) {
  AddHeader("a.h", "namespace n { namespace m { $struct A { }; } }");
  AddFile("b.h", "@import \"a.h\"\nnamespace n { $struct B { }; }");
  EXPECT_EQ(
      "",
      Fault("@import \"b.h\"\n$type+ n::m::A; namespace n { $type+ m::A; $type+ B; $struct C { }; }\n$type+ n::C;"));
}

TEST_F(LookUp, NothingIsSeenWithoutImport) {
  AddHeader("a.h", "$struct A { }; namespace n { }");
  Translate("a.h");
  EXPECT_EQ("t.cpp(1) : error : Unrecognised identifier : A", Fault("$type+ A; @import \"a.h\""));
}

TEST_F(LookUp, ForwardDeclarationsNeverConflict) {
  AddHeader("a.h", "$struct X;");
  AddHeader("b.h", "$struct X; $struct+ Y;");
  AddHeader("c.h", "$struct+ X { };");
  const std::string imports = "@import \"a.h\"\n@import \"c.h\"\n@import \"b.h\"\n";
  EXPECT_EQ("", Fault(imports + "$type+ X; $type+ Y; $struct X;\n"));
  EXPECT_EQ("t.cpp(4) : error : Repeated definition of $struct X", Fault(imports + "$struct X { };"));
  EXPECT_EQ(
      "b.h(1) : warning W1017 : + on forward declaration of Y deprecated\nc.h(1) : see declaration of $struct+ X\n",
      Messages());
}

// The newest declaration of a name is the one that may still become a definition.
TEST_F(LookUp, OwnDeclarationsMoveOn) {
  EXPECT_EQ("", Fault("$struct X; $struct Y { $X* x; }; $struct X; $struct X { }; $type+ X;"));
  MakeWorld(TargetType::Application);
  AddHeader("a.h", "$class X;");
  AddHeader("b.h", "@import \"a.h\"\n$class X; $class+ X;");
  EXPECT_EQ("", Fault("@import \"b.h\"\n$class X { }; $type+ X;"));
}

TEST_F(LookUp, Ambiguity) {
  AddHeader("a.h", "$struct X { };");
  AddHeader("b.h", "$struct X { };");
  AddHeader("c.h", "$enum X { x };");
  AddHeader("d.h", "$struct Y; $enum Z;");
  AddHeader("e.h", "$enum Y; $enum Z;");
  EXPECT_EQ("", Fault("@import \"a.h\"\n@import \"b.h\"\n@import \"c.h\"\n"));
  EXPECT_EQ("error : Ambiguous identifier : X", Fault("@import \"a.h\"\n@import \"b.h\"\n$type+ X;"));
  EXPECT_EQ("error : Ambiguous identifier : X", Fault("@import \"a.h\"\n@import \"c.h\"\n$type+ X;"));
  EXPECT_EQ("error : Ambiguous identifier : Y", Fault("@import \"d.h\"\n@import \"e.h\"\n$type+ Z; $type+ Y;"));
  EXPECT_EQ("", Fault("@import \"c.h\"\n$type+ X;"));
}

// A name space in an unnamed one is another than that of its name beside the unnamed one.
TEST_F(LookUp, UnnamedNameSpaces) {
  AddHeader("a.h", "namespace { namespace b { $enum+ E { x }; } }");
  AddHeader("b.h", "namespace b { $enum+ E { x }; }");
  const std::string imports = "@import \"a.h\"\n@import \"b.h\"\n";
  EXPECT_EQ("t.cpp(2) : error : Unrecognised identifier : E", Fault("@import \"a.h\"\nnamespace b { $type+ E; }"));
  EXPECT_EQ("", Fault(imports + "namespace b { $type+ E; } namespace { namespace b { $type+ E; } }"));
}

// One in a class body stands in the name space around the class, unless a thing of its name is seen there.
TEST_F(LookUp, ForwardDeclarationsInClasses) {
  for (const std::string nested : {"$class N;", "$struct N;", "$mixin N;", "$interface N;", "$enum N;",
                                   "$enum class N;", "$variant N;", "$struct N; $struct N;"}) {
    EXPECT_EQ("", Fault("namespace a { $struct+ K { " + nested + " $N* n; }; $type+ N; }\n$type+ a::N;")) << nested;
    MakeWorld(TargetType::Application);
  }
  AddHeader("a.h", "$struct X { };");
  AddHeader("b.h", "$struct X { }; $enum Y { y };");
  EXPECT_EQ("", Fault("@import \"a.h\"\n@import \"b.h\"\n$enum Z { z };\n"
                      "$struct+ K { $struct X; $struct Y; $struct Z; $Y y; $Z z; };"));
}

// --- Warnings

TEST_F(NameSpaceTest, WarningsOfLibraries) {
  for (TargetType target : {TargetType::StaticLibrary, TargetType::DynamicLinkLibrary}) {
    MakeWorld(target);
    AssertMessages("$class+ A { };", "t.h(1) : warning W1008 : $class+ A doesn't appear in public header of library\n");
    AssertMessages("$class A { }; $mixin M { };", "");
    AssertMessages("\n$class A { };",
                   "app/pub/t.h(2) : warning W1009 : $class A not exported in public header of library\n", "pub/t.h");
    AssertMessages("$class+ A { }; $mixin M { };", "", "pub/t.h");
  }
  MakeWorld(TargetType::Application);
  AssertMessages("$class A { }; $class+ B { };", "", "pub/t.h");
}

TEST_F(NameSpaceTest, WarningSwitches) {
  EXPECT_EQ("int a;\n\nint b;", Translate("t.cpp", "int a;\n$warning(push; disable: 1000; pop)\nint b;"));
}

// The flags belong to the file.
TEST_F(NameSpaceTest, WarningsPerFile) {
  AddHeader("a.h", "$warning(disable:1004) $struct A <<copy>> { };");
  EXPECT_EQ("", Fault("@import \"a.h\"\n$struct B <<copy>> { };"));
  EXPECT_EQ("t.cpp(2) : warning W1004 : $struct B is not reflected and has redundant << >> directives\n", Messages());
  EXPECT_EQ(1, builder->warningCount);
}

}  // namespace
}  // namespace qrex
