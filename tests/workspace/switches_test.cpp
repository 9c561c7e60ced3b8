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
  const std::map<std::string, Block> blocks = {{"+cpp", kAddCpp}, {"-cpp", kRemoveCpp}, {"+rc", kAddRc}};
  for (const auto& [block, text, message] : TextCasesOf("workspace/cases/switch_errors.txt"))
    EXPECT_EQ(message, ErrorOf(blocks.at(block), text)) << text;
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

// The properties that linkers and librarians are asked for, and what is told of the rest.
TEST_F(SwitchesTest, LinkerTexts) {
  const std::map<std::string, CompilerKind> kinds = {{"vc9", CompilerKind::vc9},
                                                     {"vc10", CompilerKind::vc10},
                                                     {"vc14", CompilerKind::vc14},
                                                     {"clang", CompilerKind::clang},
                                                     {"librarian", CompilerKind::gcc}};
  for (const auto& [tool, text, expected] : TextCasesOf("workspace/cases/linker_texts.txt")) {
    settings.compiler = kinds.at(tool);
    Project project(*workspace);
    ProjectConfig config;
    config.linkerText = text;
    OptionMap options;
    (tool == "librarian" ? ParseLibrarianText : ParseLinkerText)(project, config, options);
    EXPECT_EQ(expected + "\n", Text(options) + TakeTrace()) << text;
  }
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
