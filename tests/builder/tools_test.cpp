// The tools of a build: their command lines and response files, what comes of their output and their return codes, the
// inputs of a link. Scripts stand for the tools: they note how they were called, print what a test told them to, and
// end as told.

#include "builder/tools.h"

#include "builder/target_command.h"
#include "builder/tool_names.h"
#include "builder/tool_output.h"
#include "text/paths.h"
#include "text_cases.h"
#include "translator/file/translate_file.h"
#include "workspace/switch_blocks.h"
#include "world_fixture.h"

namespace qrex {

namespace {

class ToolsTest : public WorldTest {
 protected:
  ToolsTest() {
    settings.platformEnvironments["x64"] = {"tools;/usr/bin;/bin", "", ""};
    ApplyEnvironment(settings.platformEnvironments["x64"]);
    for (const char* tool :
         {"cl", "gcc-4", "ml", "ml64", "rc.exe", "link.exe", "lib.exe", "mt.exe", "g++", "clang++", "wineg++", "ar"}) {
      WriteProgram(std::string("tools/") + tool,
                   "echo \"$(basename \"$0\") $*\" >> log\n"
                   "for word; do case $word in @*) cat < \"${word#@}\" >> log; echo >> log;; esac; done\n"
                   "[ ! -f say ] || cat say\n[ ! -f status ] || exit $(cat status)\n");
    }
  }
  static std::string TakeLog() {
    const std::string log = FileExists("log") ? ReadText("log") : "";
    DeleteFile("log");
    return log;
  }
  // The project `app`, of sources, and of what it depends on.
  Project& AddApp(std::string_view targetType, const std::string& sources, const std::string& statements = {}) {
    return AddProject("app", targetType, statements + " qrex { \"src\" { " + sources + " } }");
  }
  ScannedFile& Source(const std::string& name) {
    return builder->GetScannedFile(*App().filesByPath.at("app/src/" + name));
  }
  bool Make(std::unique_ptr<BuildStep> step) {
    bool made = false;
    builder->scheduler.Add(std::move(step), [&made](bool succeeded) { made = succeeded; });
    return made;
  }
  bool MakeObject(const std::string& name) { return Make(ObjectStep(*builder, Source(name))); }
  bool Link(std::vector<std::string> inputs) {
    return Make(TargetStep(*builder, builder->paths.Target(), std::move(inputs)));
  }
  // A builder of the project, with its files.
  ProjectBuilder& Builder(CompilerKind compiler) {
    settings.compiler = compiler;
    StartBuild();
    App().CollectFiles();
    for (ProjectFile* file : App().files) builder->scanned.push_back(&builder->GetScannedFile(*file));
    CreateDirectories(builder->paths.Intermediate(), true);
    trace.clear();
    return *builder;
  }
};

// --- Compilers

TEST_F(ToolsTest, CompilerCommandLines) {
  Project& app = AddApp("Application", "\"x.cpp\"");
  app.configs.front()->compilerText = " -g -DA=\"b c\"";
  app.configs.front()->compilerOptions = {{"Optimization", "2"}, {"PreprocessorDefinitions", "A;B"}};
  const std::string visualIncludes =
      " /I \"qrexsource/x64/Debug/app\" /I \"qrexsource/x64/Debug/app/src\" /I \"qrexsource/x64/Debug\" /I \"tree\"";
  const std::string gccText =
      "gcc-4 -c @x64/Debug/app/compiler.rsp\n -g -DA=\"b c\" -I\"qrexsource/x64/Debug/app\""
      " -I\"qrexsource/x64/Debug/app/src\" -I\"qrexsource/x64/Debug\" -I\"tree\" -o \"x64/Debug/app/x.o\""
      " \"qrexsource/x64/Debug/app/src/x.cpp\"\n";
  auto visualText = [&](const std::string& prefix) {
    return "cl /c @x64/Debug/app/compiler.rsp\n/O2 /D \"A\" /D \"B\" /Yu\"StdAfx.h\" " + visualIncludes +
           " /Fp\"x64/Debug/app/" + prefix +
           "app.pch\" /Fo\"x64/Debug/app/\" /Fd\"x64/Debug/app/\" \"qrexsource/x64/Debug/app/src/x.cpp\"\n";
  };
  const std::pair<CompilerKind, std::string> cases[] = {{CompilerKind::gcc, gccText},
                                                        {CompilerKind::winegcc, gccText},
                                                        {CompilerKind::vc6, visualText("build_")},
                                                        {CompilerKind::vc14, visualText("")}};
  for (const auto& [compiler, expected] : cases) {
    Builder(compiler);
    ASSERT_TRUE(MakeObject("x.cpp"));
    ASSERT_EQ("", trace);
    ASSERT_EQ(expected, TakeLog());
    ASSERT_FALSE(FileExists("x64/Debug/app/compiler.rsp"));
  }
  app.usesQrex = false;
  settings.diagnostics = true;
  Builder(CompilerKind::clang);
  MakeObject("x.cpp");
  ASSERT_EQ(
      "Compiling app/src/x.cpp\nx64/Debug/app/compiler.rsp =  -g -DA=\"b c\" -I\"tree/app\" -I\"tree/app/src\""
      " -I\"tree\" -o \"x64/Debug/app/x.o\" \"tree/app/src/x.cpp\"\n"
      "cmd /c gcc-4 -c @\"x64/Debug/app/compiler.rsp\" 1>out1.txt 2>&1\n",
      trace);
}

TEST_F(ToolsTest, AssemblersAndResources) {
  Project& app = AddApp("Application", "\"x.asm\" \"r.rc\"");
  app.configs.front()->resourceOptions = {{"PreprocessorDefinitions", "A"}, {"ShowProgress", "true"}};
  Builder(CompilerKind::vc9);
  ASSERT_TRUE(MakeObject("x.asm"));
  ASSERT_EQ(
      "ml /coff /c /Cx /nologo @x64/Debug/app/masm.rsp\n /Fo\"x64/Debug/app/\" "
      "\"qrexsource/x64/Debug/app/src/x.asm\"\n",
      TakeLog());
  ASSERT_TRUE(Make(ResourceStep(*builder, Source("r.rc"))));
  ASSERT_EQ("rc.exe /d A /v /fox64/Debug/app/r.res tree/app/src/r.rc\n", TakeLog());
  ASSERT_EQ("Compiling resource file app/src/r.rc\n", trace);
  Write("status", "4");
  settings.diagnostics = true;
  trace.clear();
  ASSERT_FALSE(Make(ResourceStep(*builder, Source("r.rc"))));
  ASSERT_EQ(
      "Compiling resource file app/src/r.rc\nrc.exe /d \"A\" /v  /fo\"x64/Debug/app/r.res\" \"tree/app/src/r.rc\"\n"
      "Return code : 4\n",
      trace);
  ASSERT_EQ(1, builder->errorCount);

  TakeLog();
  app.configs.front()->platform = "Win64";
  Builder(CompilerKind::vc9);
  ASSERT_TRUE(MakeObject("x.asm"));
  ASSERT_TRUE(TakeLog().starts_with("ml64 /c /Cx /nologo @Win64/Debug/app/masm.rsp\n"));
  ASSERT_TRUE(
      trace.starts_with("Assembling app/src/x.asm\nWin64/Debug/app/masm.rsp =  /Fo\"Win64/Debug/app/\" "
                        "\"qrexsource/Win64/Debug/app/src/x.asm\"\ncmd /c ml64 /c /Cx /nologo "
                        "@\"Win64/Debug/app/masm.rsp\" 1>out1.txt\n"))
      << trace;
}

// A name is one word of a command line, and a name; where a tool cannot take it so, it is refused.
TEST_F(ToolsTest, HostileNames) {
  Project& app = AddApp("Application", "\"x.cpp\" \"y.asm\" \"z.rc\"");
  const auto kGcc = CompilerKind::gcc, kVisual = CompilerKind::vc9;
  const struct {
    CompilerKind compiler;
    const char* name;
    const char* platform;
    const char* said;  // of the call; else the error
  } cases[] = {
      {kGcc, "a\\b.cpp", "x64", R"(-o "x64/Debug/app/a\\b.o" "qrexsource/x64/Debug/app/src/a\\b.cpp")"},
      {kGcc, "a.cpp", "-x", "-o \"./-x/Debug/app/a.o\" \"qrexsource/-x/Debug/app/src/a.cpp\"\n"},
      {kGcc, "a.cpp", "@x", "-o \"./@x/Debug/app/a.o\" "},
      {kGcc, "a\nb.cpp", "x64", "app/src/a\nb.cpp : a line ends in it\n"},
      {kGcc, "a\"b.cpp", "x64", "app/src/a\"b.cpp : a double quote stands in it\n"},
      {kVisual, "a\\b.cpp", "x64", "app/src/a\\b.cpp : a backslash parts folders there\n"},
      {kVisual, "a.cpp", "-x", "name -x/Debug/app/a.obj : it would be read as an option\n"},
  };
  for (const auto& test : cases) {
    SCOPED_TRACE(test.said);
    app.configs.front()->platform = test.platform;
    Builder(test.compiler);
    for (ScannedFile* scanned : builder->scanned) {
      scanned->file.path = PathJoin("app/src", test.name);
      StemOf(test.name, scanned->file.stem);
    }
    ScannedFile &resource = *builder->scanned[0], &source = *builder->scanned[1], &assembled = *builder->scanned[2];
    if (Make(ObjectStep(*builder, source))) {
      EXPECT_NE(std::string::npos, TakeLog().find(test.said));
    } else {
      EXPECT_FALSE(Make(ObjectStep(*builder, assembled)) || Make(ResourceStep(*builder, resource)));
      EXPECT_EQ(3, builder->errorCount);
      EXPECT_NE(std::string::npos, trace.find(test.said)) << trace;
      EXPECT_EQ("", TakeLog());
    }
  }
}

// What a compiler's output and return code make of a file, and of the object that it left.
TEST_F(ToolsTest, ResultsOfACompiler) {
  AddApp("Application", "\"x.cpp\"");
  const auto kGcc = CompilerKind::gcc, kVisual = CompilerKind::vc14;
  const struct {
    CompilerKind compiler;
    const char* output;
    const char* status;
    bool succeeds;
    int64_t errors, warnings;
    bool keepsObject;
  } cases[] = {
      {kVisual, "x.cpp\n", "0", true, 0, 0, true},
      {kVisual, "x.cpp(3) : warning C4100: w\n", "2", true, 0, 1, true},
      {kVisual, "x.cpp(3) : error C1: e\nx.cpp(4) : error C2: e\n", "0", false, 2, 0, true},
#ifndef _WIN32  // where they are codes like others
      {kVisual, "", "127", false, 1, 0, false},
      {kVisual, "x.cpp(3) : error C1: e\n", "139", false, 1, 0, false},
#endif
      {kGcc, "", "0", true, 0, 0, true},
      {kGcc, "x.cpp:3:5: warning: w\n", "0", true, 0, 1, true},
      {kGcc, "x.cpp:3:5: error: e\n", "1", false, 1, 0, false},
      {kGcc, "gcc: fatal error: no input files\n", "1", false, 1, 0, false},
      {kGcc, "", "127", false, 1, 0, false},
  };
  for (const auto& test : cases) {
    SCOPED_TRACE(std::string(test.output) + test.status);
    Builder(test.compiler);
    Write("say", test.output);
    Write("status", test.status);
    const std::string object = builder->paths.Object(Source("x.cpp").file);
    Write(object, "object");
    EXPECT_EQ(test.succeeds, MakeObject("x.cpp"));
    EXPECT_EQ(test.errors, builder->errorCount);
    EXPECT_EQ(test.warnings, builder->warningCount);
    EXPECT_EQ(test.keepsObject, FileExists(object));
    EXPECT_NE(std::string::npos, trace.find(test.output));
  }
}

// One would take the other's place in the target.
TEST_F(ToolsTest, OneObjectOfTwoSources) {
  AddProject("app", "Application", "qrex { \"one\" { \"same.cpp\" } \"two\" { \"same.cpp\" } }");
  Write("tree/app/one/same.cpp", "int a;\n");
  Write("tree/app/two/same.cpp", "int b;\n");
  settings.translateOnly = false;
  StartBuild();
  EXPECT_FALSE(builder->Build("app.qrexdep", nullptr));
  EXPECT_EQ(1, builder->errorCount);
  const std::string expected =
      "ERROR: No object can be made of app/two/same.cpp : x64/Debug/app/same.o is that of app/one/same.cpp\n";
  EXPECT_NE(std::string::npos, trace.find(expected)) << trace;
  EXPECT_EQ(std::string::npos, trace.find("Linking"));
}

// --- Output

// Errors and warnings of each compiler.
TEST_F(ToolsTest, MessagesAreCounted) {
  AddApp("Application", "");
  for (const auto& [compiler, text, counts] : TextCasesOf("builder/cases/messages.txt")) {
    Builder(compiler == "gcc" ? CompilerKind::gcc : CompilerKind::vc9);
    const ToolMessages found = ScanToolOutput(*builder, text);
    EXPECT_EQ(counts, std::to_string(found.errors) + " " + std::to_string(found.warnings)) << text;
    EXPECT_EQ(text, trace);
  }
}

TEST_F(ToolsTest, LaunchersSpeakForThemselves) {
  AddApp("Application", "");
  Builder(CompilerKind::gcc);
  const ToolMessages found = ScanToolOutput(
      *builder,
      "distcc[7] h:1: error: x\nDISTCC: a.cpp:1: error\ndistcc.cpp:1: error: y\na.cpp:1: warning: distcc: z\n",
      "distcc");
  EXPECT_EQ(1, found.errors);
  EXPECT_EQ(1, found.warnings);
}

TEST_F(ToolsTest, WordsAreThoseThatTheToolWouldRead) {
  using Words = std::vector<std::string>;
  constexpr CompilerKind kGcc = CompilerKind::gcc, kVisual = CompilerKind::vc9;
  const struct {
    CompilerKind compiler;
    const char* text;
    Words words;
  } cases[] = {
      {kGcc,
       " -DA=\"b c\"  -I\"d\\\\e\"\t'f \"g'\r\n\\\"h \"\" i\\ j",
       {"-DA=b c", "-Id\\e", "f \"g", "\"h", "", "i j"}},
      {kGcc, "\"open end", {"open end"}},
      {kGcc, " \n", {}},
      {kGcc, "end\\", {"end\\"}},
      {kVisual,
       "/Fo\"a b/\" /DX=\\\"y\\\" c\\d \"e\\\\\" 'f g' \\\\\\\"",
       {"/Foa b/", "/DX=\"y\"", "c\\d", "e\\", "'f", "g'", "\\\""}},
  };
  for (const auto& test : cases) EXPECT_EQ(test.words, ResponseWords(test.compiler, test.text)) << test.text;
}

TEST_F(ToolsTest, ALauncherMayFailForEveryFamily) {
  WriteProgram("tools/lead", "echo \"lead $*\" >> log; \"$@\"\nexit 3\n");
  settings.launcher = {"lead", "a b"};
  AddApp("Application", "\"x.cpp\"");
  Write("tree/app/src/x.cpp", "int x;\n");
  Builder(CompilerKind::vc9);
  EXPECT_FALSE(MakeObject("x.cpp"));
  EXPECT_EQ(1, builder->errorCount);
  EXPECT_NE(std::string::npos, TakeLog().find("lead a b cl /c @x64/Debug/app/compiler.rsp\n"));
}

TEST_F(ToolsTest, ManyMessagesInALineTakeLinearTime) {
  AddApp("Application", "");
  constexpr int kMessages = 100'000;
  const struct {
    CompilerKind compiler;
    const char* message;
  } cases[] = {{CompilerKind::vc9, "qrexsource/x64/Debug/x.cpp(1) : error "},
               {CompilerKind::gcc, "x.cpp:1:1: error: "}};
  for (const auto& test : cases) {
    Builder(test.compiler);
    std::string text;
    for (int i = 0; i < kMessages; ++i) text += test.message;
    EXPECT_EQ(kMessages, ScanToolOutput(*builder, text).errors);
  }
}

TEST_F(ToolsTest, MessagesPointAtTheSource) {
  AddApp("Application", "\"x.cpp\" \"unused.cpp\"");
  Write("tree/app/src/x.cpp", "@def both = { int a;\nint b; }\nboth\nint c;\n");
  Builder(CompilerKind::gcc);
  ScannedFile& scanned = Source("x.cpp");
  scanned.needsWriting = true;
  BringUpToDate(scanned);
  trace.clear();
  std::string folder;
  FullPathOf(".", folder);
  const std::string translated = "qrexsource/x64/Debug/app/src/x.cpp";
  ScanToolOutput(*builder,
                 translated + "(3) : error A\n\t./" + translated + "(2) : note\n" + folder +
                     "/QREXSOURCE\\x64\\Debug/app\\src\\x.cpp(1): warning B\n" + translated +
                     ":3:1: error: C\ntree/app/src/x.cpp(1) : error D\nqrexsource/x64/Debug/no.cpp(1) : error E");
  ASSERT_EQ("tree/app/src/x.cpp(4) ...\n" + translated + "(3) : error A\n\ttree/app/src/x.cpp(3) ...\n\t./" +
                translated + "(2) : note\ntree/app/src/x.cpp(1) ...\n" + folder +
                "/QREXSOURCE\\x64\\Debug/app\\src\\x.cpp(1): warning B\ntree/app/src/x.cpp(4) ...\n" + translated +
                ":3:1: error: C\ntree/app/src/x.cpp(1) : error D\nqrexsource/x64/Debug/no.cpp(1) : error E",
            trace);

  // As a compiler spells it that came there through an include path or another file.
  for (const std::string& spelling :
       {std::string("qrexsource/x64/Debug/app/api/../src/x.cpp"),
        std::string("./qrexsource/none/.././x64//Debug/app/src/x.cpp"),
        "../" + std::string(FileNameOf(folder)) + "/" + translated, folder + "/tree\\..\\" + translated}) {
    for (const char* message : {":3:1: error: C\n", "(3) : error C\n"}) {
      trace.clear();
      ScanToolOutput(*builder, spelling + message);
      EXPECT_EQ("tree/app/src/x.cpp(4) ...\n" + spelling + message, trace);
    }
  }
  // What cannot be mapped is told at its line.
  trace.clear();
  const std::string first = "a.cpp(1) : error A\n", second = "qrexsource/x64/Debug/app/src/unused.cpp(1) : error B\n";
  ScanToolOutput(*builder, first + second);
  ASSERT_EQ(
      first + "\nNOTE: Need @import instead of #include \"unused.cpp\" to pinpoint errors in original source files\n" +
          second,
      trace);
}

// --- Links

TEST_F(ToolsTest, VisualLinks) {
  WriteProject("base", "Static Library", "+link { \"z.lib\" } qrex { }");
  Project& app = AddApp("Dynamic-Link Library", R"("a.cpp" "b.c" "c.asm" "r.rc" "h.h")", "subproj { \"base\" }");
  app.configs.front()->linkerText = " /DLL x.obj \"$(Platform).lib\" /OUT:\"o $(Platform)/$(Configuration).dll\" /ltcg";
  app.configs.front()->generalOptions["WholeProgramOptimization"] = "1";
  Builder(CompilerKind::vc14);
  ASSERT_EQ("lib/x64/Debug/app.dll", builder->paths.Target());
  ASSERT_TRUE(Link(CollectLinkInputs(builder->project, builder->config)));
  ASSERT_EQ(
      "link.exe @x64/Debug/app/linker.rsp\n /DLL /OUT:\"o x64/Debug.dll\" /ltcg \"x64/Debug/app/b.obj\""
      " \"x64/Debug/app/r.res\" \"x64/Debug/app/a.obj\" \"x64/Debug/app/c.obj\" \"x64.lib\" \"lib/x64/Debug/base.lib\""
      " \"z.lib\"\n"
      "mt.exe @x64/Debug/app/mt.rsp /nologo\n/outputresource:\"lib/x64/Debug/app.dll\";#2 /manifest"
      " \"./x64/Debug/app/app.dll.intermediate.manifest\"\n\n",
      TakeLog());
  ASSERT_EQ("Linking...\n", trace);
  ASSERT_TRUE(ReadText("x64/Debug/app/mt.dep").starts_with("Manifest resource last updated at "));
  ASSERT_FALSE(FileExists("x64/Debug/app/mt.rsp") || FileExists("x64/Debug/app/mtdep.bat"));

  app.configs.front()->linkerText = "/LTCG:STATUS";
  app.targetType = TargetType::StaticLibrary;
  Builder(CompilerKind::vc14);
  ASSERT_TRUE(Link({"a.obj", "$(Configuration).obj"}));
  ASSERT_EQ("lib.exe @x64/Debug/app/linker.rsp\n /LTCG:STATUS /LTCG \"a.obj\" \"Debug.obj\"\n", TakeLog());
  app.libraryIsStatic = true;
  const std::vector<std::string> inputs = CollectLinkInputs(builder->project, builder->config);
  ASSERT_EQ(3u, inputs.size());
}

TEST_F(ToolsTest, FailedLinks) {
  AddApp("Application", "");
  Write("status", "5");
  Builder(CompilerKind::vc14);
  ASSERT_FALSE(Link({"a.obj"}));
  ASSERT_EQ(
      "Linking...\nlink.exe @\"x64/Debug/app/linker.rsp\"\nReturn code : 5\nx64/Debug/app/linker.rsp:  \"a.obj\"\n",
      trace);
  trace.clear();
  WriteProgram("tools/link.exe", "touch lib/x64/Debug/app.exe\n");
  ASSERT_FALSE(Link({"a.obj"}));
  ASSERT_EQ("Linking...\nmt.exe @\"x64/Debug/app/mt.rsp\" /nologo\nReturn code : 5\n", trace);
  ASSERT_FALSE(FileExists("lib/x64/Debug/app.exe"));
  std::filesystem::remove_all("x64");
  trace.clear();
  ASSERT_FALSE(Link({"a.obj"}));
  ASSERT_EQ("Error writing  \"a.obj\" - linking failed\n", trace);
  ASSERT_EQ(3, builder->errorCount);
}

TEST_F(ToolsTest, GccLinks) {
  WriteProject("top", "Static Library", "subproj { \"base\" \"middle\" } { }");
  WriteProject("middle", "Static Library", "subproj { \"base\" } { }");
  WriteProject("base", "Static Library", R"(+link { -lno "v/b.a" "-lz" "-Wl,-no" "$@"; "$@" } { })");
  WriteProject("shared", "Dynamic-Link Library", "export subproj { \"hidden\" } { }");
  WriteProject("hidden", "Static Library", "{ }");
  Project& app = AddApp("Application", "\"a.cpp\" \"r.rc\"", "subproj { \"top\" \"shared\" \"base\" }");
  app.configs.front()->linkerText = " -lm \"-Wl,-z now\" \"v/$(Platform).a\" -L$(Configuration) -Wl,-z,$$x";
  const std::string inputs =
      " \"x64/Debug/app/a.o\" \"lib/x64/Debug/libtop.a\" \"lib/x64/Debug/libmiddle.a\" \"tree/x64/Debug/libshared.so\""
      " \"lib/x64/Debug/libbase.a\" \"v/b.a\" \"-lz\" -Xlinker -rpath -Xlinker '$ORIGIN' -lm \"-Wl,-z now\" "
      "\"v/x64.a\" -LDebug -Wl,-z,$x\n";
  Builder(CompilerKind::gcc);
  ASSERT_TRUE(Link(CollectLinkInputs(builder->project, builder->config)));
  ASSERT_EQ("g++ @x64/Debug/app/linker.rsp\n-o \"lib/x64/Debug/app\"" + inputs, TakeLog());
  ASSERT_EQ((std::vector<std::string>{"v/b.a", "-lz", "v/x64.a"}),
            LibrariesOfSwitches(builder->project, builder->config));

  app.targetType = TargetType::DynamicLinkLibrary;
  for (const auto& [compiler, linker] :
       {std::pair(CompilerKind::clang, "clang++"), {CompilerKind::winegcc, "wineg++"}}) {
    Builder(compiler);
    Link(CollectLinkInputs(builder->project, builder->config));
    ASSERT_EQ(linker + (" @x64/Debug/app/linker.rsp\n-o \"lib/x64/Debug/libapp.so\" -shared"
                        " \"-Wl,-soname,libapp.so\"" +
                        inputs),
              TakeLog());
  }

  app.targetType = TargetType::StaticLibrary;
  Builder(CompilerKind::gcc);
  Write("lib/x64/Debug/libapp.a", "old members");
  Link(CollectLinkInputs(builder->project, builder->config));
  ASSERT_EQ("ar rcs lib/x64/Debug/libapp.a @x64/Debug/app/linker.rsp\n \"x64/Debug/app/a.o\"\n", TakeLog());
  ASSERT_FALSE(FileExists("lib/x64/Debug/libapp.a"));
}

}  // namespace

}  // namespace qrex
