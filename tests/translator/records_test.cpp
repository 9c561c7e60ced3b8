// Where reflection records go, how they are registered, and what a project's main file holds.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class RecordsTest : public TranslateTest {
 protected:
  void Reflect(const std::string& header, const std::string& name) {
    AddFile(header, "@import \"Vesk/vxObject/IObject.h\"\n$enum+ " + name + " { x };\n");
  }
  // The things that the tail of a generated text registers.
  static std::string Registered(const std::string& text) {
    std::string names;
    const std::string mark = "// Registration of ";
    for (size_t at = 0; (at = text.find(mark, at)) != std::string::npos;) {
      at += mark.size();
      names += (names.empty() ? "" : ", ") + text.substr(at, text.find('\n', at) - at);
    }
    return names;
  }
};

TEST_F(RecordsTest, NothingToRegister) {
  EXPECT_EQ("", TranslateHeader("$struct A { $int32 x; }; $type int8; $type+<<-register>> int16;").tail);
}

// Tails of headers go into the .cpp of the same stem, or else into the first that imports them directly.
TEST_F(RecordsTest, PlacesOfTails) {
  Reflect("own.h", "Own");
  Reflect("free.h", "Free");
  Reflect("deep.h", "Deep");
  AddFile("mid.h", "@import \"deep.h\"\n$enum+ Mid { x };");
  AddFile("own.cpp",
          "@import \"own.h\"\n@import \"free.h\"\n"
          "namespace a {\nnamespace b { $enum+ E { x }; $enum+ F <<-register>> { y }; }\n}\n");
  AddFile("other.cpp", "@import \"mid.h\"\n@import \"own.h\"\n@import \"free.h\"\n");
  EXPECT_EQ("$enum+ Own, $enum+ Free, $enum+ a::b::E", Registered(Translate("own.cpp")));
  EXPECT_EQ("$enum+ Mid", Registered(Translate("other.cpp")));
  EXPECT_EQ("", Messages());
  EXPECT_EQ((std::vector<std::string>{"Own", "Free", "a::b::E"}), builder->RegisterMap().entries["app/src/own.cpp"]);
}

TEST_F(RecordsTest, HeaderOfSameNameNotImported) {
  Reflect("a.h", "A");
  AddFile("b.h", "@import \"a.h\"\n");
  AddFile("a.cpp", "@import \"b.h\"\n");
  EXPECT_EQ("#include \"b.h\"\n", Translate("a.cpp"));
  EXPECT_EQ("a.cpp(1) : warning : cpp file doesn't directly import header with same name\n", Messages());
}

TEST_F(RecordsTest, ForeignHeadersAreNotRegistered) {
  AddFileTo(AddProject("lib", "Static Library", "qrex { }"), "lib/x.h", "$enum+ X { x };");
  EXPECT_EQ("", Registered(Translate("t.cpp", "@import \"lib/x.h\"\n")));
  EXPECT_TRUE(builder->RegisterMap().entries.empty());
}

TEST_F(RecordsTest, MainFileOfWindowsLibrary) {
  settings.systemName = "Windows";
  MakeWorld(TargetType::DynamicLinkLibrary);
  AddProject("libs/stat", "Static Library", "qrex { }");
  AddProject("libs/dyn", "Dynamic-Link Library", "qrex { }");
  AddProject("tool", "Console Application", "qrex { }");
  AddProject("plain", "Static Library", "{ }");
  App().subprojects = {"libs/dyn/src/dyn.qrpj", "tool/src/tool.qrpj", "plain/src/plain.qrpj", "none/src/none.qrpj",
                       "libs/stat/src/stat.qrpj"};
  builder->RegisterMap().Update("app/src/b.cpp", {"n::m::B", "C"});
  builder->RegisterMap().Update("app/src/a.cpp", {"A"});
  builder->UnregisterMap().Update("app/src/a.cpp", {"n::a0"});
  const std::string registerText =
      "\nextern \"C\" __declspec(dllimport) void Register_Project_dyn();\nvoid Register_Project_stat();\n"
      "\nvoid _Register_A(); \nnamespace n { namespace m { void _Register_B(); }}\nvoid _Register_C(); \n"
      "\nextern \"C\" _declspec(dllexport) void Register_Project_app()\n"
      "{\n    static bool s_called = false;\n    if (s_called) return;\n    s_called = true;\n"
      "    Register_Project_dyn();\n    Register_Project_stat();\n"
      "    _Register_A();\n    n::m::_Register_B();\n    _Register_C();\n}\n";
  const std::string unregisterText =
      "\nextern \"C\" __declspec(dllimport) void Unregister_Project_dyn();\nvoid Unregister_Project_stat();\n"
      "\nnamespace n { void _Unregister_a0(); }\n"
      "\nextern \"C\" _declspec(dllexport) void Unregister_Project_app()\n"
      "{\n    static bool s_called = false;\n    if (s_called) return;\n    s_called = true;\n"
      "    Unregister_Project_dyn();\n    Unregister_Project_stat();\n    n::_Unregister_a0();\n}\n";
  AddFile("app.cpp", "");
  EXPECT_EQ(registerText + unregisterText, Translate("app.cpp"));
  settings.systemName = "Linux";
  std::string plain = registerText + unregisterText;
  ReplaceAllInPlace(plain, "__declspec(dllimport) ", "");
  ReplaceAllInPlace(plain, "_declspec(dllexport) ", "");
  EXPECT_EQ(plain, Translate("app.cpp"));
}

// A file whose text is no other than before, token by token, stays as it is.
TEST_F(RecordsTest, TokenEquivalentOutputStays) {
  settings.writeTokenEquivalent = false;
  settings.diagnostics = true;
  AddFile("t.c", "int a; // one\n");
  ScannedFile& file = Scanned("t.c");
  auto write = [&](const std::string& text) {
    trace.clear();
    Write(file.SourcePath(), text);
    Translate("t.c");
    EXPECT_FALSE(file.needsWriting);
    return Read(builder->TranslatedPath(file));
  };
  EXPECT_EQ("int a; // one\r\n", write("int a; // one\n"));
  EXPECT_EQ("Writing: qrexsource/x64/Debug/t.c\n", Messages());
  EXPECT_EQ("int a; // one\r\n", write("int /* two */ a;\n\n"));
  EXPECT_EQ("Token equivalent: qrexsource/x64/Debug/t.c\n", Messages());
  EXPECT_EQ("int b;", write("int b;"));
}

}  // namespace
}  // namespace qrex
