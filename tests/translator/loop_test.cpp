// The main loop: what is copied, what head, foot and line table look like, and the directives that belong to no kind.

#include "translator/translate_fixture.h"

namespace qrex {
namespace {

class LoopTest : public TranslateTest {
 protected:
  std::string SourceOf(const std::string& name, int64_t generatedLine) {
    std::string path;
    int64_t line = 0;
    TraceWriter messages;
    if (!Scanned(name).MapGeneratedLine(generatedLine, messages, path, line)) return "none";
    return path + ":" + std::to_string(line);
  }
};

TEST_F(LoopTest, WrapsHeaders) {
  EXPECT_EQ(
      "#pragma once\n#ifndef _app_src_sub_dir_my_file2_h\n#define _app_src_sub_dir_my_file2_h\n\nint x;"
      "\n#endif // include guard\n",
      Translate("src/sub-dir/my.file2.h", "int x;"));
}

TEST_F(LoopTest, ImportsBecomeIncludes) {
  AddFile("a.h", "int a;\n");
  AddFile("api/b.h", "int b;\n");
  EXPECT_EQ(
      "int x;\n  #include \"a.h\" // first\n#include \"api/b.h\"\n#include <map>\n#include \"other.h\"\n",
      Translate("t.cpp",
                "int x;\n  @import \"a.h\" // first\n@import \"api/b.h\"\n#include <map>\n#include \"other.h\"\n"));
  EXPECT_EQ("t2.cpp(2) : error : #include should be replaced by @import",
            ErrorOf("t2.cpp", "int x;\n#include \"a.h\"\n"));
  EXPECT_EQ("t3.cpp(1) : error : Can't import file: none.h", ErrorOf("t3.cpp", "@import \"none.h\"\n"));
  EXPECT_EQ("#include \"a.h\"\n", Translate("t.asm", "#include \"a.h\"\n"));
}

// A project that is not translated may be included as it is.
TEST_F(LoopTest, IncludesOfPlainProjects) {
  AddFileTo(AddProject("plain", "Static Library", "{ }"), "plain/p.h", "int p;\n");
  EXPECT_EQ("#include \"plain/p.h\"\n", Translate("t.cpp", "#include \"plain/p.h\"\n"));
  EXPECT_EQ("error : File plain/p.h is not part of a project using qrex", ErrorOf("u.cpp", "@import \"plain/p.h\"\n"));
}

TEST_F(LoopTest, ImportCycles) {
  AddFile("a.h", "@import \"b.h\"\n");
  AddFile("b.h", "int b;\n@import \"a.h\"\n");
  EXPECT_EQ("a.h(1) : error : Can't import file: b.h", ErrorOf("t.cpp", "@import \"a.h\"\n"));
  EXPECT_EQ("\nERROR: Cycle detected in import directives.  Files in cycle are...\n    a.h\n    b.h\n", Messages());
  EXPECT_EQ("self.h(1) : error : Can't import file: self.h", ErrorOf("self.h", "@import \"self.h\"\n"));
}

TEST_F(LoopTest, NameSpacesAndBraces) {
  const Generated generated = TranslateHeader(
      "namespace a {\nnamespace b\n{ int f() { return 1; }\n$enum+ E { x };\n}\n$enum+ F { y };\n} using namespace a;\n"
      "namespace { $enum+ G { z }; }\nusing std::swap;\n");
  EXPECT_NE(std::string::npos, generated.tail.find("//### $enum+ a::F\n"));
  EXPECT_NE(std::string::npos, generated.tail.find("//### $enum+ a::b::E\n"));
  EXPECT_NE(std::string::npos, generated.tail.find("namespace \n{\n    vesk::ReflectedEnum const& _GetReflected(G"));
}

// With the key; without it, each is the error that it always was.
TEST_F(LoopTest, CppOfToday) {
  const std::string text =
      "#error don't\n#if 0\nit's \"\n#endif\nauto s = R\"x({ $class @if \"\n)x\";\nint gr\xC3\xB6\xC3\x9F = 1'000 + "
      "0x##x;"
      "\nx = y++ += '\\101'; // }\n}\nnamespace a {\n}\n} $enum+ E { v };\n";
  EXPECT_EQ("a.cpp(1) : error : Met line feed within single quoted string after reading 't", ErrorOf("a.cpp", text));
  settings.modernCpp = true;
  const std::string plain = text.substr(0, text.find("$enum"));
  EXPECT_EQ(plain, Translate("b.cpp", plain));
  EXPECT_EQ(plain, Translate("c.cpp", "\xEF\xBB\xBF" + plain));
  EXPECT_TRUE(TranslateHeader(text).tail.find("//### $enum+ E\n") != std::string::npos);
  EXPECT_EQ("d.cpp(3) : error : Met EOS within raw string R\"(", ErrorOf("d.cpp", "R\"(\n)\"\nR\"("));
  EXPECT_EQ("e.cpp(4) : error : '$x' is not a valid directive", ErrorOf("e.cpp", "\xEF\xBB\xBFR\"(\n)\"\n\n$x"));
  EXPECT_EQ("f.py(1) : error : Met line feed within single quoted string after reading 't", ErrorOf("f.py", "don't\n"));
}

TEST_F(LoopTest, WordsOfCppInDeclarations) {
  const std::string trailing = "$function+ auto f() -> int32 { return 1; }";
  EXPECT_EQ("a.h(1) : error : Unrecognised identifier : auto", ErrorOf("a.h", trailing));
  settings.modernCpp = true;
  EXPECT_EQ(
      "b.h(1) : error : Unrecognised identifier : auto\n"
      "    auto: a declaration names its type: write it out, ahead of the name",
      ErrorOf("b.h", trailing));
  auto advice = [&, n = 0](const std::string& text) mutable {
    const std::string error = ErrorOf("c" + std::to_string(n++) + ".h", "@import \"Vesk/vxObject/IObject.h\"\n" + text);
    const size_t line = error.find("\n    ");
    return line == std::string::npos ? "none: " + error : error.substr(line + 5, error.find(':', line) - line - 5);
  };
  EXPECT_EQ("noexcept", advice("$function+ int32 f() noexcept { return 1; }"));
  EXPECT_EQ("constexpr", advice("$var+ constexpr int32 x = 1;"));
  EXPECT_EQ("[[", advice("$function+ [[nodiscard]] int32 f() { return 1; }"));
  EXPECT_EQ("=", advice("$model+ M { int32 x = 1; };"));
  EXPECT_EQ("none", advice("$function+ autos f() { }").substr(0, 4));
  const std::string passes = "[[nodiscard]] constexpr vesk::int32 f() { return 1; }";
  EXPECT_NE(std::string::npos,
            Translate("d.h", "[[nodiscard]] constexpr $function+ int32 f() { return 1; }").find(passes));
}

TEST_F(LoopTest, InitAndUninit) {
  const std::string text = Translate("app.cpp", "$init { a(); }\nnamespace n { $init {}\n}\n$uninit { b(); }\n");
  EXPECT_EQ(
      "void _Register_app0()\n{ a(); }\nnamespace n { void _Register_app1()\n{}\n}\nvoid _Unregister_app0()\n{ b(); }\n"
      "\n\nvoid _Register_app0(); \nnamespace n { void _Register_app1(); }\n\n",
      Section(text, "", "void Register_Project_app()"));
  EXPECT_EQ("    _Register_app0();\n    n::_Register_app1();\n}\n\n\nvoid _Unregister_app0(); \n\n",
            Section(text, "s_called = true;\n", "void Unregister"));
  EXPECT_TRUE(text.ends_with("    _Unregister_app0();\n}\n"));
}

TEST_F(LoopTest, ErrorsOfDirectives) {
  std::string nested;
  for (int i = 0; i < 1001; ++i) nested += "namespace n {\n";
  AssertError(nested, 1001, "Declarations nested too deeply");
}

// Errors in expanded text are told at the source that it came from.
TEST_F(LoopTest, PositionsThroughMacros) {
  EXPECT_EQ("t.h(4) : error : '$bogus' is not a valid directive", ErrorOf("t.h", "@def mac = x\n\n\n$bogus mac\nmac"));
  EXPECT_EQ("u.h(1) : error : Can't match }", ErrorOf("u.h", "@def shut = }\n\nshut\n"));
}

TEST_F(LoopTest, LineTable) {
  const std::string generated =
      Translate("t.h", "int a;\n@import \"Vesk/vxObject/IObject.h\"\n\n$struct S\n{\n};\nint b;\n");
  const size_t b =
      static_cast<size_t>(std::count(generated.begin(), generated.begin() + generated.find("int b"), '\n'));
  const std::string path = "tree/app/src/t.h";
  EXPECT_EQ("none", SourceOf("t.h", 4));
  EXPECT_EQ(path + ":1", SourceOf("t.h", 5));
  EXPECT_EQ(path + ":2", SourceOf("t.h", 6));
  EXPECT_EQ(path + ":4", SourceOf("t.h", 8)) << "generated text stands at the declaration";
  EXPECT_EQ(path + ":7", SourceOf("t.h", static_cast<int64_t>(b) + 1));
  EXPECT_EQ(path + ":7", SourceOf("t.h", 10000));
  AddFile("never.h", "");
  EXPECT_EQ("none", SourceOf("never.h", 5));
  EXPECT_EQ("\nNOTE: Need @import instead of #include \"never.h\" to pinpoint errors in original source files\n",
            Messages());
  trace.clear();
  Translate("empty.cpp", "");
  EXPECT_EQ("none", SourceOf("empty.cpp", 1));
  EXPECT_EQ("\nINTERNAL ERROR: convert error position failed because line number invalid\n", Messages());
}

TEST_F(LoopTest, PredefinedVariables) {
  MakeWorld(TargetType::DynamicLinkLibrary);
  settings.systemProcessor = "x86";
  settings.systemVersion = "6";
  settings.sizeofPointer = "8";
  const std::string text =
      "@is_public_header @is_header @is_cpp @root_to_file_path @filename @filename_without_extension @file_extension "
      "@workspace @project @root_to_projdir_path @platform @system_name @system_processor @system_version "
      "@size_of_pointer @config @api @target_type";
  EXPECT_EQ("false false false app/src/t.py t.py t py all app app x64 Linux x86 6 8 Debug app_API Dynamic-Link Library",
            Translate("t.py", text));
  EXPECT_EQ("false false true", Translate("u.cpp", "@is_public_header @is_header @is_cpp"));
  EXPECT_NE(std::string::npos, Translate("pub/v.h", "@is_public_header @is_header @is_cpp").find("true true false"));
  EXPECT_EQ(App().rootDir + "/app/src/w.py " + App().rootDir, Translate("w.py", "@file_path @root_path"));
}

TEST_F(LoopTest, CompilerMacros) {
  const std::string text = "@macros [@macroA] [@macroB] [@macroC]";
  App().configs.front()->compilerText = "-O2 -DA  -D\"B\" -Wall";
  EXPECT_EQ("A \"B\" [] [] [@macroC]", Translate("t.py", text));
  settings.compiler = CompilerKind::vc10;
  MakeWorld(TargetType::Application);
  App().configs.front()->compilerOptions["PreprocessorDefinitions"] = "A;C";
  EXPECT_EQ("A;C [] [@macroB] []", Translate("t.py", text));
}

}  // namespace
}  // namespace qrex
