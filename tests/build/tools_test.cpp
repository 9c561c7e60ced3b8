// The tools of a build: their command lines and response files, what comes of their output and their return codes, the
// inputs of a link. Scripts stand for the tools: they note how they were called, print what a test told them to, and
// end as told.

#include "build/tools.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>

#include "build/run_command.h"
#include "build/tool_output.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/trace.h"
#include "translator/file/translate_file.h"
#include "workspace/switch_blocks.h"

namespace qrex {

namespace {

class ToolsTest : public ::testing::Test, public TraceHook {
 protected:
  ToolsTest() : m_start(std::filesystem::current_path()), m_path(std::getenv("PATH")) {
    m_folder = std::filesystem::path(::testing::TempDir()) /
               ("tools." + std::to_string(getpid()) + ::testing::UnitTest::GetInstance()->current_test_info()->name());
    std::filesystem::remove_all(m_folder);
    std::filesystem::create_directories(m_folder);
    std::filesystem::current_path(m_folder);
    SetTraceHook(this);
    settings.virtualTree = {"tree"};
    settings.exportLib = "lib";
    settings.platformEnvironments["x64"] = {"tools;/usr/bin;/bin", "", ""};
    ApplyEnvironment(settings.platformEnvironments["x64"]);
    for (const char* tool :
         {"cl", "gcc-4", "ml", "ml64", "rc.exe", "link.exe", "lib.exe", "mt.exe", "g++", "clang++", "wineg++", "ar"}) {
      AddTool(tool,
              "echo \"$(basename \"$0\") $*\" >> log\n"
              "for word; do case $word in @*) cat \"${word#@}\" >> log; echo >> log;; esac; done\n"
              "[ ! -f say ] || cat say\n[ ! -f status ] || exit $(cat status)\n");
    }
  }
  ~ToolsTest() override {
    SetTraceHook(nullptr);
    builder.reset();
    setenv("PATH", m_path.c_str(), 1);
    std::filesystem::current_path(m_start);
    std::filesystem::remove_all(m_folder);
  }
  void OnTrace(std::string_view text) override { trace += text; }

  static void AddFile(const std::string& path, const std::string& text) {
    CreateDirectories(path, false);
    ReplaceFile(path, text);
  }
  static void AddTool(const std::string& name, const std::string& script) {
    AddFile("tools/" + name, "#!/bin/sh\n" + script);
    std::filesystem::permissions("tools/" + name, std::filesystem::perms::owner_all);
  }
  std::string TakeLog() {
    std::string log;
    LoadText(log, "log", true);
    DeleteFile("log");
    return log;
  }

  Project& AddProject(const std::string& name, TargetType type, const std::vector<std::string>& subprojects = {}) {
    Project& project = *workspace.projects.emplace_back(std::make_unique<Project>(workspace));
    project.name = name;
    project.targetType = type;
    project.usesQrex = true;
    project.rootDir = "tree";
    project.rootToProjDir = name;
    project.sourceDir = name + "/src";
    for (const std::string& subproject : subprojects) project.subprojects.push_back(subproject + ".qrpj");
    ProjectConfig& config = *project.configs.emplace_back(std::make_unique<ProjectConfig>());
    config.name = "Debug";
    config.platform = "x64";
    return project;
  }
  static ProjectFile& AddSource(Project& project, const std::string& name, const std::string& text = {}) {
    const std::string path = project.sourceDir + "/" + name;
    auto made = std::make_unique<ProjectFile>();
    made->path = path;
    auto& file = project.filesByPath.emplace(made->path, std::move(made)).first->second;
    file->project = &project;
    file->name = name;
    StemOf(name, file->stem);
    file->kind = FileKindOf(name.substr(file->stem.size() + 1));
    project.rootFolder.files.push_back(file.get());
    AddFile("tree/" + path, text);
    return *file;
  }
  // A builder of the first project, with its files.
  ProjectBuilder& Builder(CompilerKind compiler) {
    settings.compiler = compiler;
    Project& project = *workspace.projects.front();
    project.CollectFiles();
    builder = std::make_unique<ProjectBuilder>(settings, project, *project.configs.front());
    for (ProjectFile* file : project.files) builder->scanned.push_back(&builder->GetScannedFile(*file));
    CreateDirectories(builder->IntermediateDirectory(), true);
    trace.clear();
    return *builder;
  }

  ConfigSettings settings;
  Workspace workspace{settings};
  std::unique_ptr<ProjectBuilder> builder;
  std::string trace;

 private:
  std::filesystem::path m_start, m_folder;
  std::string m_path;
};

// --- Commands

TEST_F(ToolsTest, RunCommandAnswersAsTheOptionsSay) {
  std::string output, errors;
  int code;
  const CommandOptions capture{.output = &output, .errors = &errors};
  ASSERT_TRUE(RunCommand("cmd /c exit 3", code, {}));
  ASSERT_EQ(3, code);
  ASSERT_EQ("", trace);
  AddTool("both", "printf 'a\\r\\nb'\nprintf oops >&2\n");
  ASSERT_TRUE(RunCommand("both", code, capture));
  ASSERT_EQ("a\nb|oops|oops\n", output + "|" + errors + "|" + trace);
  ASSERT_FALSE(FileExists("out1.txt") || FileExists("out2.txt"));
  trace.clear();
  ASSERT_TRUE(RunCommand("both", code, {.echo = true, .output = &output, .errorsIntoOutput = true}));
  ASSERT_EQ("a\nboops|both 1>out1.txt 2>&1\n", output + "|" + trace);
  trace.clear();
  ASSERT_FALSE(RunCommand("both", code, {.output = &output, .errors = &errors, .failOnErrorText = true}));
  ASSERT_EQ("both 1>out1.txt 2>out2.txt\noops\n", trace);
}

TEST_F(ToolsTest, CommandsThatFail) {
  AddTool("dies", "kill -ABRT $$\n");
  AddFile("plain", "");
  std::filesystem::create_directory("out2.txt");
  std::string text;
  const struct {
    const char* command;
    CommandOptions options;
    const char* trace;
  } cases[] = {
      {"exit 7", {.failOnNonZero = true}, "exit 7\nReturn code : 7\n"},
      {"exit 7", {.echo = true, .failOnNonZero = true}, "exit 7\nReturn code : 7\n"},
      {"cmd /c nosuch x 2>/dev/null",
       {.failOnNonZero = true},
       "ERROR: nosuch was not found on PATH\ncmd /c nosuch x 2>/dev/null\nReturn code : 127\n"},
      {"dies", {.failOnNonZero = true}, "ERROR: dies was ended by signal 6\ndies\nReturn code : 134\n"},
      {"./plain 2>/dev/null",
       {.failOnNonZero = true},
       "ERROR: ./plain cannot be executed\n./plain 2>/dev/null\nReturn code : 126\n"},
      {"true", {.errors = &text}, "true 2>out2.txt\nERROR getting stderr\n"},
      {"rm out1.txt", {.output = &text}, "rm out1.txt 1>out1.txt\nERROR getting stdout\n"},
  };
  for (const auto& [command, options, expected] : cases) {
    int code;
    trace.clear();
    EXPECT_FALSE(RunCommand(command, code, options)) << command;
    EXPECT_EQ(expected, trace);
  }
}

TEST_F(ToolsTest, InterruptedCommandsEndTheRun) {
  AddTool("stopped", "kill -INT $$\n");
  std::string output;
  int code;
  try {
    RunCommand("cmd /c stopped x", code, {.output = &output});
    FAIL();
  } catch (const LexScannerException& exception) {
    ASSERT_EQ("Interrupted while running stopped", exception.message);
  }
  ASSERT_FALSE(FileExists("out1.txt"));
}

// --- Compilers

TEST_F(ToolsTest, CompilerCommandLines) {
  Project& app = AddProject("app", TargetType::Application);
  ProjectFile& source = AddSource(app, "x.cpp");
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
    ASSERT_TRUE(CompileFile(*builder, builder->GetScannedFile(source)));
    ASSERT_EQ("", trace);
    ASSERT_EQ(expected, TakeLog());
    ASSERT_FALSE(FileExists("x64/Debug/app/compiler.rsp"));
  }
  app.usesQrex = false;
  settings.diagnostics = true;
  Builder(CompilerKind::clang);
  CompileFile(*builder, builder->GetScannedFile(source));
  ASSERT_EQ(
      "Compiling app/src/x.cpp\nx64/Debug/app/compiler.rsp =  -g -DA=\"b c\" -I\"tree/app\" -I\"tree/app/src\""
      " -I\"tree\" -o \"x64/Debug/app/x.o\" \"tree/app/src/x.cpp\"\n"
      "cmd /c gcc-4 -c @\"x64/Debug/app/compiler.rsp\" 1>out1.txt 2>&1\n",
      trace);
}

TEST_F(ToolsTest, AssemblersAndResources) {
  Project& app = AddProject("app", TargetType::Application);
  ProjectFile& assembly = AddSource(app, "x.asm");
  ProjectFile& resource = AddSource(app, "r.rc");
  app.configs.front()->resourceOptions = {{"PreprocessorDefinitions", "A"}, {"ShowProgress", "true"}};
  Builder(CompilerKind::vc9);
  ASSERT_TRUE(AssembleFile(*builder, builder->GetScannedFile(assembly)));
  ASSERT_EQ(
      "ml /coff /c /Cx /nologo @x64/Debug/app/masm.rsp\n /Fo\"x64/Debug/app/\" "
      "\"qrexsource/x64/Debug/app/src/x.asm\"\n",
      TakeLog());
  ASSERT_TRUE(CompileResource(*builder, builder->GetScannedFile(resource)));
  ASSERT_EQ("rc.exe /d A /v /fox64/Debug/app/r.res tree/app/src/r.rc\n", TakeLog());
  ASSERT_EQ("Compiling resource file app/src/r.rc\n", trace);
  AddFile("status", "4");
  settings.diagnostics = true;
  trace.clear();
  ASSERT_FALSE(CompileResource(*builder, builder->GetScannedFile(resource)));
  ASSERT_EQ(
      "Compiling resource file app/src/r.rc\nrc.exe /d \"A\" /v  /fo\"x64/Debug/app/r.res\" \"tree/app/src/r.rc\"\n"
      "Return code : 4\n",
      trace);
  ASSERT_EQ(1, builder->errorCount);

  TakeLog();
  app.configs.front()->platform = "Win64";
  Builder(CompilerKind::vc9);
  ASSERT_TRUE(AssembleFile(*builder, builder->GetScannedFile(assembly)));
  ASSERT_TRUE(TakeLog().starts_with("ml64 /c /Cx /nologo @Win64/Debug/app/masm.rsp\n"));
  ASSERT_TRUE(
      trace.starts_with("Assembling app/src/x.asm\nWin64/Debug/app/masm.rsp =  /Fo\"Win64/Debug/app/\" "
                        "\"qrexsource/Win64/Debug/app/src/x.asm\"\ncmd /c ml64 /c /Cx /nologo "
                        "@\"Win64/Debug/app/masm.rsp\" 1>out1.txt\n"))
      << trace;
}

// What a compiler's output and return code make of a file, and of the object that it left.
TEST_F(ToolsTest, ResultsOfACompiler) {
  ProjectFile& source = AddSource(AddProject("app", TargetType::Application), "x.cpp");
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
      {kVisual, "", "127", false, 1, 0, false},
      {kVisual, "x.cpp(3) : error C1: e\n", "139", false, 1, 0, false},
      {kGcc, "", "0", true, 0, 0, true},
      {kGcc, "x.cpp:3:5: warning: w\n", "0", true, 0, 1, true},
      {kGcc, "x.cpp:3:5: error: e\n", "1", false, 1, 0, false},
      {kGcc, "gcc: fatal error: no input files\n", "1", false, 1, 0, false},
      {kGcc, "", "127", false, 1, 0, false},
  };
  for (const auto& test : cases) {
    SCOPED_TRACE(std::string(test.output) + test.status);
    Builder(test.compiler);
    AddFile("say", test.output);
    AddFile("status", test.status);
    const std::string object = ObjectPath(*builder, source);
    AddFile(object, "object");
    EXPECT_EQ(test.succeeds, CompileFile(*builder, builder->GetScannedFile(source)));
    EXPECT_EQ(test.errors, builder->errorCount);
    EXPECT_EQ(test.warnings, builder->warningCount);
    EXPECT_EQ(test.keepsObject, FileExists(object));
    EXPECT_NE(std::string::npos, trace.find(test.output));
  }
}

// --- Output

TEST_F(ToolsTest, MessagesAreCounted) {
  AddProject("app", TargetType::Application);
  const auto kGcc = CompilerKind::gcc, kVisual = CompilerKind::vc9;
  const struct {
    CompilerKind compiler;
    const char* text;
    int64_t errors, warnings;
  } cases[] = {
      {kVisual, "a.cpp(12) : error C2143: syntax error", 1, 0},
      {kVisual, "a.cpp(12): warning C4100: x", 0, 1},
      {kVisual, "  a.cpp(12)\t:\twarn", 0, 1},
      {kVisual, "a.cpp(12) : fatal error C1083: x", 0, 0},
      {kVisual, "a.cpp(12) : Error", 0, 0},
      {kVisual, "a.cpp : error C2143: x", 0, 0},
      {kVisual, "a.cpp() : error", 0, 0},
      {kVisual, "a.cpp(1x) : error", 0, 0},
      {kVisual, "a.cpp(12 ) : error", 0, 0},
      {kVisual, "a.cpp(12) error", 0, 0},
      {kVisual, "note: see (3) : error", 1, 0},
      {kVisual, "f((3) : error", 1, 0},
      {kVisual, "a(1) : error b(2) : error c(3) : warning", 2, 1},
      {kVisual, "a \"b(2) : error", 0, 0},
      {kVisual, "a*b(2) : error", 0, 0},
      {kVisual, "a(99999999999999999999999) : error", 1, 0},
      {kVisual, "a(1) : error\n\n  \nb(2) : warning\n", 1, 1},
      {kVisual, "a.cpp:12:3: error: x", 0, 0},
      {kGcc, "a.cpp:12:3: error: x", 1, 0},
      {kGcc, "a.cpp:12: fatal error: x", 1, 0},
      {kGcc, "a.cpp:12:3: warning: x(3) : error", 1, 1},
      {kGcc, "In file included from a.cpp:12:", 0, 0},
      {kGcc, "a.cpp:12:3: note: x", 0, 0},
      {kGcc, "a.cpp(12): error: x", 1, 0},
      {kGcc, "", 0, 0},
  };
  for (const auto& test : cases) {
    Builder(test.compiler);
    EXPECT_EQ(test.errors == 0, ScanToolOutput(*builder, test.text)) << test.text;
    EXPECT_EQ(test.errors, builder->errorCount) << test.text;
    EXPECT_EQ(test.warnings, builder->warningCount) << test.text;
    EXPECT_EQ(test.text, trace);
  }
}

TEST_F(ToolsTest, MessagesPointAtTheSource) {
  Project& app = AddProject("app", TargetType::Application);
  ProjectFile& source = AddSource(app, "x.cpp", "@def both = { int a;\nint b; }\nboth\nint c;\n");
  ProjectFile& unused = AddSource(app, "unused.cpp");
  Builder(CompilerKind::gcc);
  builder->GetScannedFile(unused);
  ScannedFile& scanned = builder->GetScannedFile(source);
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
  Project& app = AddProject("app", TargetType::DynamicLinkLibrary, {"base"});
  AddProject("base", TargetType::StaticLibrary).configs.front()->linkerText = "\"z.lib\"";
  for (const char* name : {"a.cpp", "b.c", "c.asm", "r.rc", "h.h"}) AddSource(app, name);
  app.configs.front()->linkerText = " /DLL x.obj \"$(Platform).lib\" /OUT:\"o $(Platform)/$(Configuration).dll\" /ltcg";
  app.configs.front()->generalOptions["WholeProgramOptimization"] = "1";
  Builder(CompilerKind::vc14);
  ASSERT_EQ("lib/x64/Debug/app.dll", TargetPath(*builder));
  ASSERT_TRUE(LinkTarget(*builder, TargetPath(*builder), CollectLinkInputs(*builder)));
  ASSERT_EQ(
      "link.exe @x64/Debug/app/linker.rsp\n /DLL /OUT:\"o x64/Debug.dll\" /ltcg \"x64/Debug/app/b.obj\""
      " \"x64/Debug/app/r.res\" \"x64/Debug/app/a.obj\" \"x64/Debug/app/c.obj\" \"x64.lib\" \"lib/x64/Debug/base.lib\""
      " \"z.lib\"\n",
      TakeLog());
  ASSERT_EQ("Linking...\n", trace);
  ASSERT_TRUE(EmbedManifest(*builder));
  ASSERT_EQ(
      "mt.exe @x64/Debug/app/mt.rsp /nologo\n/outputresource:\"lib/x64/Debug/app.dll\";#2 /manifest"
      " \"./x64/Debug/app/app.dll.intermediate.manifest\"\n\n",
      TakeLog());
  std::string mark;
  ASSERT_TRUE(LoadText(mark, "x64/Debug/app/mt.dep", true));
  ASSERT_EQ("Manifest resource last updated at ", mark.substr(0, 34));
  ASSERT_FALSE(FileExists("x64/Debug/app/mt.rsp") || FileExists("x64/Debug/app/mtdep.bat"));

  app.configs.front()->linkerText = "/LTCG:STATUS";
  app.targetType = TargetType::StaticLibrary;
  Builder(CompilerKind::vc14);
  ASSERT_TRUE(LinkTarget(*builder, TargetPath(*builder), {"a.obj", "$(Configuration).obj"}));
  ASSERT_EQ("lib.exe @x64/Debug/app/linker.rsp\n /LTCG:STATUS /LTCG \"a.obj\" \"Debug.obj\"\n", TakeLog());
  ASSERT_TRUE(EmbedManifest(*builder));
  ASSERT_EQ("", TakeLog());
  app.libraryIsStatic = true;
  const std::vector<std::string> inputs = CollectLinkInputs(*builder);
  ASSERT_EQ(3u, inputs.size());
}

TEST_F(ToolsTest, FailedLinks) {
  AddProject("app", TargetType::Application);
  AddFile("status", "5");
  Builder(CompilerKind::vc14);
  ASSERT_FALSE(LinkTarget(*builder, TargetPath(*builder), {"a.obj"}));
  ASSERT_EQ(
      "Linking...\nlink.exe @\"x64/Debug/app/linker.rsp\"\nReturn code : 5\nx64/Debug/app/linker.rsp:  \"a.obj\"\n",
      trace);
  trace.clear();
  ASSERT_FALSE(EmbedManifest(*builder));
  ASSERT_EQ("mt.exe @\"x64/Debug/app/mt.rsp\" /nologo\nReturn code : 5\n", trace);
  std::filesystem::remove_all("x64");
  trace.clear();
  ASSERT_FALSE(LinkTarget(*builder, TargetPath(*builder), {"a.obj"}));
  ASSERT_EQ("Error writing  \"a.obj\" - linking failed\n", trace);
  ASSERT_EQ(3, builder->errorCount);
}

TEST_F(ToolsTest, GccLinks) {
  Project& app = AddProject("app", TargetType::Application, {"top", "shared", "base"});
  AddProject("top", TargetType::StaticLibrary, {"base", "middle"});
  AddProject("middle", TargetType::StaticLibrary, {"base"});
  AddProject("base", TargetType::StaticLibrary);
  AddProject("shared", TargetType::DynamicLinkLibrary, {"hidden"}).exported = true;
  AddProject("hidden", TargetType::StaticLibrary);
  AddSource(app, "a.cpp");
  AddSource(app, "r.rc");
  app.configs.front()->linkerText = " -lm \"-Wl,-z now\"";
  std::string folder;
  FullPathOf("lib/x64/Debug", folder);
  const std::string inputs =
      " \"x64/Debug/app/a.o\" \"lib/x64/Debug/libtop.a\" \"lib/x64/Debug/libmiddle.a\" \"tree/x64/Debug/libshared.so\""
      " \"lib/x64/Debug/libbase.a\" -Xlinker -rpath -Xlinker \"" +
      folder + "\" -lm \"-Wl,-z now\"\n";
  Builder(CompilerKind::gcc);
  ASSERT_TRUE(LinkTarget(*builder, TargetPath(*builder), CollectLinkInputs(*builder)));
  ASSERT_EQ("g++ @x64/Debug/app/linker.rsp\n-o \"lib/x64/Debug/app\"" + inputs, TakeLog());

  app.targetType = TargetType::DynamicLinkLibrary;
  for (const auto& [compiler, linker] :
       {std::pair(CompilerKind::clang, "clang++"), {CompilerKind::winegcc, "wineg++"}}) {
    Builder(compiler);
    LinkTarget(*builder, TargetPath(*builder), CollectLinkInputs(*builder));
    ASSERT_EQ(linker + (" @x64/Debug/app/linker.rsp\n-o \"lib/x64/Debug/libapp.so\" -shared"
                        " \"-Wl,-soname,libapp.so\"" +
                        inputs),
              TakeLog());
  }

  app.targetType = TargetType::StaticLibrary;
  Builder(CompilerKind::gcc);
  AddFile("lib/x64/Debug/libapp.a", "old members");
  LinkTarget(*builder, TargetPath(*builder), CollectLinkInputs(*builder));
  ASSERT_EQ("ar rcs lib/x64/Debug/libapp.a @x64/Debug/app/linker.rsp\n \"x64/Debug/app/a.o\"\n", TakeLog());
  ASSERT_FALSE(FileExists("lib/x64/Debug/libapp.a"));
}

}  // namespace

}  // namespace qrex
