// Switch blocks and linker texts: what they say as properties, how configurations and files take them over, and how
// they come back as command lines.

#include "message_of.h"
#include "text_cases.h"
#include "workspace/linker_text.h"
#include "workspace/switch_blocks.h"
#include "world_fixture.h"

namespace qrex {

namespace {

class PlainParser : public MpfwParser {
 public:
  explicit PlainParser(MpfwContext& context) : MpfwParser(context) {}
  bool ResolveImport(const std::string&, std::string&) override { return false; }
  void OnImportedFile(MpfwSourceFile&) override {}
};

class SwitchesTest : public WorldTest {
 protected:
  enum Block { kAddCpp, kRemoveCpp, kAddRc, kRemoveRc };
  SwitchChanges Read(Block block, const std::string& text) {
    PlainParser parser(settings.context);
    parser.SetInput(TextRange(std::string_view(text)));
    const bool isRemoval = block == kRemoveCpp || block == kRemoveRc;
    SwitchChanges changes = block == kAddCpp || block == kRemoveCpp ? ReadCompilerSwitches(parser, isRemoval)
                                                                    : ReadResourceSwitches(parser, isRemoval);
    EXPECT_EQ("EOS", Printed(parser.current)) << text;
    return changes;
  }

  // The entries one a line, "name=value"; an error as its message.
  static std::string Text(const OptionMap& options) {
    std::string text;
    for (const auto& [name, value] : options) text += name + "=" + value + "\n";
    return text;
  }
  std::string ErrorOf(Block block, const std::string& text) {
    return MessageOf([&] { return "no error, but " + Text(Read(block, text).entries); });
  }
  void AssertRead(Block block, const std::string& switches, const std::string& expected) {
    ASSERT_EQ(expected, Text(Read(block, "{ " + switches + " }").entries)) << switches;
  }

  // Applies blocks to the options of a configuration, one behind the other.
  struct Step {
    Block block;
    std::string switches;
  };
  OptionMap Applied(const std::vector<Step>& steps) {
    OptionMap options;
    for (const Step& step : steps) Read(step.block, "{ " + step.switches + " }").Apply(options);
    return options;
  }

  std::string Linked(const std::string& text, CompilerKind compiler = CompilerKind::vc14) {
    return Parsed(text, compiler, ParseLinkerText);
  }
  std::string Archived(const std::string& text) { return Parsed(text, CompilerKind::gcc, ParseLibrarianText); }

 private:
  std::string Parsed(const std::string& text, CompilerKind compiler,
                     void (*parse)(const Project&, const ProjectConfig&, OptionMap&)) {
    settings.compiler = compiler;
    Project project(*workspace);
    ProjectConfig config;
    config.linkerText = text;
    OptionMap options;
    parse(project, config, options);
    return Text(options);
  }
};

TEST_F(SwitchesTest, WhatSwitchesSay) {
  settings.context.rootFrame.DefineSubstitution("DIR", "inc");
  for (const auto& [name, switches, expected] : TextCasesOf("workspace/cases/switches.txt"))
    AssertRead(kAddCpp, switches, expected);
  AssertRead(kRemoveCpp, "/Yu \"all.h\"", "UsePrecompiledHeader=2\n");
  ASSERT_EQ(
      "warning: Compiler switch /GX is deprecated\nwarning: Compiler switch /GZ is deprecated\n"
      "warning: Compiler switch /Fr is deprecated\nwarning: Compiler switch /clr:noAssembly is deprecated\n",
      trace);
}

TEST_F(SwitchesTest, ErrorsInCompilerBlocks) {
  static constexpr struct {
    Block block;
    const char* text;
    const char* message;
  } kCases[] = {
      {kAddCpp, "/O2", "Expected '{' when read /"},
      {kAddCpp, "{ /FR \"x\" }", "Expected '}' when read \"x\""},
      {kAddCpp, "{ /wd4100 }", "Invalid switch /wd4100"},
      {kRemoveCpp, "{ /wd 4100 }", "Subtraction of /wd not supported"},
      {kAddCpp, "{ /arch }", "Invalid switch /arch"},
      {kAddCpp, "{ /arch:SSE3 }", "Invalid switch /arch:SSE3"},
      {kAddCpp, "{ /od }", "Invalid switch /od"},
      {kAddCpp, "{ / }", "Invalid switch / }"},
      {kAddCpp, "{ /", "Invalid switch /"},
      {kAddCpp, "{ /Ge }", "Invalid switch /Ge"},
      {kAddCpp, "{ /Gf }", "/Gf not supported, use /GF instead"},
      {kAddRc, "{ /w }", "Invalid resource compiler switch /w"},
  };
  for (const auto& [block, text, message] : kCases) EXPECT_EQ(message, ErrorOf(block, text)) << text;
}

TEST_F(SwitchesTest, ConfigurationsTakeSwitchesOver) {
  ASSERT_EQ("PreprocessorDefinitions=A;B;C\n",
            Text(Applied({{kAddCpp, "/D \"A\" /D \"B\""}, {kAddCpp, "/D \"B\" /D \"C\" /D \"A\""}})));
  ASSERT_EQ("AdditionalOptions=/MP4 /Zm200\nDisableSpecificWarnings=2\nOptimization=0\n",
            Text(Applied({{kAddCpp, "/MP4 /O2 /wd 1"}, {kAddCpp, "/Zm200 /Od /wd 2"}})));
  ASSERT_EQ("PreprocessorDefinitions=B;D\nUndefinePreprocessorDefinitions=\n",
            Text(Applied({{kAddCpp, "/D \"A\" /D \"B\" /D \"C\" /D \"D\" /Fo \"x\" /O2 /GR"},
                          {kRemoveCpp, "/D \"A\" /D \"C\" /D \"X\" /U \"u\" /Fo /Od /GR"}})));
  ASSERT_EQ(
      "AdditionalIncludeDirectories=\nCulture=0x407\nPreprocessorDefinitions=N\n",
      Text(Applied(
          {{kAddRc, "/I \"a\" /d \"N\" /l 0x409 /v"}, {kAddRc, "/l 0x407 /d \"N\""}, {kRemoveRc, "/I \"a\" /v"}})));
}

TEST_F(SwitchesTest, FilesTakeAwayWhatTheyInherit) {
  const OptionMap config = Applied({{kAddCpp, "/D \"A\" /D \"B\" /O2 /GR /I \"3rdparty\""}});
  OptionMap record;
  auto subtract = [&](const std::string& switches) {
    Read(kRemoveCpp, "{ " + switches + " }").ApplyToFile(record, config);
    return Text(record);
  };
  ASSERT_EQ("", subtract("/D \"X\" /U \"Y\""));
  ASSERT_EQ("PreprocessorDefinitions=B;$(NOINHERIT)\n", subtract("/D \"A\""));
  ASSERT_EQ("PreprocessorDefinitions=$(NOINHERIT)\n", subtract("/D \"B\""));
  record.clear();
  ASSERT_EQ("Optimization=0\nRuntimeTypeInfo=false\n", subtract("/O2 /GR"));
  ASSERT_EQ("Optimization=0\nRuntimeTypeInfo=true\n", subtract("/GR-"));
  record = {{"PreprocessorDefinitions", "B;C"}};
  ASSERT_EQ("PreprocessorDefinitions=B;C;$(NOINHERIT)\n", subtract("/D \"A\""));
  record = {{"PreprocessorDefinitions", "C;X"}};
  ASSERT_EQ("PreprocessorDefinitions=C\n", subtract("/D \"X\""));
  record.clear();
  ASSERT_EQ("AdditionalIncludeDirectories=$(NOINHERIT)\n", subtract("/I \"3rdparty\""));
  record.clear();
  trace.clear();
  ASSERT_EQ("", subtract("/Od /Fo"));
  ASSERT_EQ(
      "Warning, unable to subtract option ObjectFile = \"\". It will be ignored\n"
      "Warning, unable to subtract option Optimization = \"0\". It will be ignored\n",
      trace);
}

TEST_F(SwitchesTest, CommandLines) {
  ProjectConfig config;
  ProjectFile file;
  auto switches = [&](FileKind kind) {
    file.kind = kind;
    MemoryTextWriter out;
    WriteCompilerSwitches(out, file, config);
    return out.TakeText();
  };
  config.compilerOptions = Applied(
      {{kAddCpp,
        "/GX /GZ /GR- /GL /nologo /W3 /I \"a b\" /I \"c\" /D \"X=1\" /MP4 /Zm200 /wd 4100 /Fo \"o\" /Yu /EHs"}});
  ASSERT_EQ("/I \"a b\" /I \"c\" /MP4 /Zm200 /RTC1 /EHs /D \"X=1\" /GR- /nologo /W3 /GL ", switches(FileKind::C));
  config.compilerOptions = {{"ExceptionHandling", "1"}, {"OpenMP", "false"}, {"Optimization", "9"}};
  ASSERT_EQ("/EHsc /Yu\"StdAfx.h\" ", switches(FileKind::Cpp));
  file.RecordOf(config).options["UsePrecompiledHeader"] = "1";
  file.RecordOf(config).options["Optimization"] = "2";  // of one file: no part of a command line
  config.generalOptions["WholeProgramOptimization"] = "1";
  ASSERT_EQ("/EHsc /GL /Yc\"StdAfx.h\" ", switches(FileKind::Cpp));
  config.compilerOptions["WholeProgramOptimization"] = "1";
  ASSERT_EQ("/EHsc /GL- /Yc\"StdAfx.h\" ", switches(FileKind::Cpp));

  config.resourceOptions = Applied({{kAddRc, "/x /v /I \"r\" /I \"s\" /d \"D\" /u \"U\" /l 0x409 /fo \"f\""}});
  MemoryTextWriter out;
  trace.clear();
  WriteResourceSwitches(out, config);
  ASSERT_EQ("/I \"r\" /I \"s\" /x /d \"D\" /v /u \"U\" ", out.TakeText());
  ASSERT_EQ("Ignored : Culture = 0x409\nIgnored : ResourceOutputFileName = f\n", trace);
}

TEST_F(SwitchesTest, LinkerTokens) {
  using Tokens = std::vector<std::string>;
  ASSERT_EQ((Tokens{"/A", "/B:\"x y\"z", "\"q\\\" r\"", "c"}), LinkerTokens("  /A\t/B:\"x y\"z \"q\\\" r\"\n\vc "));
  ASSERT_EQ(Tokens{}, LinkerTokens(" \r\n"));
  ASSERT_EQ("Met EOS within switch after reading \"a b", MessageOf([] { LinkerTokens("/OUT:\"a b"); }));
}

TEST_F(SwitchesTest, LinkerProperties) {
  ASSERT_EQ(
      "AdditionalDependencies=\nEnableUAC=2?\nErrorReporting=3?\nGenerateManifest=false\nImageHasSafeExceptionHandlers="
      "?1\n"
      "LinkIncremental=1\nLinkTimeCodeGeneration=4\nShowProgress=?6\nSubSystem=1\nSwapRunFromNet=true\nTargetMachine="
      "17\n"
      "UACExecutionLevel=3?\nUACUIAccess=true?\n",
      Linked("/subsystem:console /MACHINE:x64 /INCREMENTAL:NO /Manifest:no /MANIFESTUAC /LEVEL='requireAdministrator' "
             "/uiaccess='TRUE' /SAFESEH:NO /LTCG:PGUPDATE /VERBOSE:CLR /errorReport:send /SwapRun:Net /DLL "
             "/pdbtype:sept"));
  ASSERT_EQ(
      "AdditionalDependencies=\nAdditionalLibraryDirectories=a;b c\nAdditionalOptions=/out:x.exe /PDB: /ODD:\"1\"\n"
      "IgnoreAllDefaultLibraries=true\nIgnoreDefaultLibraryNames=libc\nKeyFile=k\nOutputFile=X.exe\n",
      Linked("/OUT:\"X.exe\" /out:x.exe /LIBPATH:\"a\" /libpath:\"b c\" /PDB: /NODEFAULTLIB /nodefaultlib:\"libc\" "
             "/ODD:\"1\" /KeyFile:\"k\""));
  ASSERT_EQ(
      "AdditionalDependencies=\nGenerateMapFile=true\nHeapReserveSize=0x10\nMapFileName=a.map\nStackCommitSize=4096\n"
      "StackReserveSize=1048576\n",
      Linked("/STACK:1048576,4096 /heap:0x10 /MAP:\"a.map\""));
  ASSERT_EQ("AdditionalDependencies=\nAdditionalOptions=/MAP:a.map /HEAP\n", Linked("/MAP:a.map /HEAP"));
  ASSERT_EQ("", trace);
}

TEST_F(SwitchesTest, LibrariesOfALinkerText) {
  const std::string text = "\"z.lib\" \"USER32.lib\" \"x.lib\" \"z.lib\"";
  ASSERT_EQ("AdditionalDependencies=x.lib;z.lib;\n", Linked(text, CompilerKind::vc10));
  ASSERT_EQ("AdditionalDependencies=&quot;x.lib&quot; &quot;z.lib&quot;\n", Linked(text, CompilerKind::vc9));
  ASSERT_EQ("AdditionalDependencies=\n", Archived(text));
}

TEST_F(SwitchesTest, LibrariansKnowLess) {
  ASSERT_EQ(
      "AdditionalDependencies=\nAdditionalLibraryDirectories=p\nExportNamedFunctions=f;g\nIgnoreAllDefaultLibraries="
      "true\n"
      "ModuleDefinitionFile=d\nOutputFile=o\nSuppressStartupBanner=true\n",
      Archived("/nologo /NODEFAULTLIB /OUT:\"o\" /DEF:\"d\" /EXPORT:\"f\" /export:\"g\" /LIBPATH:\"p\""));
  ASSERT_EQ("", trace);
  ASSERT_EQ("AdditionalDependencies=\n", Archived("/SUBSYSTEM:CONSOLE /OUT:o x.lib / /:a"));
  ASSERT_EQ(
      "ERROR: Invalid librarian switch : /SUBSYSTEM:CONSOLE\nERROR: Invalid librarian switch : /OUT:o\n"
      "ERROR: Unexpected librarian argument: x.lib\nERROR: Invalid librarian switch : /\n"
      "ERROR: Invalid librarian switch : /:a\n",
      trace);
}

TEST_F(SwitchesTest, StrangeLinkerArguments) {
  ASSERT_EQ("AdditionalDependencies=\n", Linked("x.lib / /:a -lm"));
  ASSERT_EQ(
      "ERROR: Unexpected linker argument: x.lib\nERROR: Invalid linker switch : /\nERROR: Invalid linker switch : /:a\n"
      "ERROR: Unexpected linker argument: -lm\n",
      trace);
  trace.clear();
  Linked("x.lib -lm", CompilerKind::clang);
  ASSERT_EQ("", trace);
}

// --- Libraries of subprojects

class LibrariesTest : public SwitchesTest {
 protected:
  std::string Gathered(const Project& project, LibraryChoice choice) {
    std::set<std::string> libraries;
    GatherLibraries(project, *project.configs.front(), choice, libraries);
    std::string text;
    for (const std::string& library : libraries) text += library + " ";
    return text;
  }
};

TEST_F(LibrariesTest, StaticSubprojectsBringTheirsAlong) {
  WriteProject("base", "Static Library", "subproj { \"deep\" \"base\" } +link { /X \"ws2.lib\" \"kernel32.lib\" } { }");
  WriteProject("deep", "Static Library", "export { }");
  WriteProject("dll", "Dynamic-Link Library", "subproj { \"hidden\" } +link { \"hidden.lib\" } { }");
  WriteProject("hidden", "Static Library", "{ }");
  WriteProject("tool", "Utility Project", "{ }");
  Project& app = AddProject("app", "Application", "subproj { \"base\" \"dll\" \"tool\" } { }");
  app.AddSubproject("gone.qrpj");
  ASSERT_EQ("kernel32.lib lib/x64/Debug/base.lib lib/x64/Debug/dll.lib tree/x64/Debug/deep.lib ws2.lib ",
            Gathered(app, {}));
  ASSERT_EQ("Error : Can't find subproject gone.qrpj under project app\n", trace);
  const LibraryChoice forGenerators{.skipDefaultLibraries = true, .forBuild = false};
  ASSERT_EQ("tree/x64/Debug/deep.lib ws2.lib ", Gathered(app, forGenerators));
  workspace->FindProjectByName("dll")->configs.front()->compilerOptions["ManagedExtensions"] = "1";
  workspace->FindProjectByName("base")->configs.front()->compilerOptions["ManagedExtensions"] = "0";
  ASSERT_EQ("lib/x64/Debug/dll.lib tree/x64/Debug/deep.lib ws2.lib ", Gathered(app, forGenerators));

  trace.clear();
  workspace->FindProjectByName("base")->configs.front()->name = "Release";
  Gathered(app, {});
  ASSERT_EQ(
      "Error : Can't find config Debug|x64 in project base\nError : Can't find subproject gone.qrpj under project "
      "app\n",
      trace);
}

}  // namespace

}  // namespace qrex
