// The configuration file: what statements do to the settings, the messages, and what a mode demands.

#include "driver/config_parser.h"
#include "driver/configured_paths.h"
#include "driver/run_workspace.h"
#include "text_cases.h"
#include "world_fixture.h"

namespace qrex {
namespace {

std::string Joined(const std::vector<std::string>& entries) {
  std::string text;
  for (const std::string& entry : entries) text += "[" + entry + "]";
  return text;
}

class ConfigTest : public WorldTest {
 protected:
  ConfigTest() { Reset(); }

  void Reset() {
    m_settings = std::make_unique<ConfigSettings>();
    trace.clear();
  }
  void Load(const std::string& text, const std::string& extraText = {}) {
    Reset();
    Write("main.qrex", text);
    EXPECT_TRUE(LoadConfiguration(*m_settings, "main.qrex", extraText)) << trace;
  }
  void AssertFails(const std::string& text, const std::string& expected) {
    Reset();
    Write("main.qrex", text);
    EXPECT_FALSE(LoadConfiguration(*m_settings, "main.qrex", "")) << text;
    EXPECT_EQ(expected, trace) << text;
  }
  ConfigSettings& Got() { return *m_settings; }

 private:
  std::unique_ptr<ConfigSettings> m_settings;
};

TEST_F(ConfigTest, Keys) {
  Load(
      "virtualTree = { \"a\" ('b' + \"c\") } virtualTree += { 'd' }\n"
      "workspaces = { \"old\" } workspaces = { } workspaces += { \"w\" }\n"
      "config = \"Old\" config=\"New\" platform = ('P') systemName = \"N\" systemProcessor = \"R\"\n"
      "systemVersion = \"V\" sizeofPointer = \"8\"\n"
      "platformToolset = \"v143\" windowsSdk = (\"10\" + '.0')\n"
      "compiler = winegcc mode = show runtime = built\n"
      "targetXP = true defaultToDll = false diagnostics = true translateOnly = true rebuildAll = true modernCpp = "
      "true\n"
      "exportPublicHeaders = false repackageExecutableTargets = false solutionContainsPrepackagedProjects = false\n"
      "makeTranslatedFilesReadOnly = false makeExportedHeaderFilesReadOnly = false writeTokenEquivalent = false // the "
      "end",
      "mode=clean\n");
  EXPECT_EQ("[a][bc][d]", Joined(Got().virtualTree));
  EXPECT_EQ("[w]", Joined(Got().workspaces));
  EXPECT_EQ("New P N R V 8", Got().config + " " + Got().platform + " " + Got().systemName + " " +
                                 Got().systemProcessor + " " + Got().systemVersion + " " + Got().sizeofPointer);
  EXPECT_EQ("v143 10.0", Got().platformToolset + " " + Got().windowsSdk);
  EXPECT_EQ(CompilerKind::winegcc, Got().compiler);
  EXPECT_EQ(RuntimeChoice::Built, Got().runtime);
  EXPECT_EQ(RunMode::Clean, Got().mode);  // a line of the command line comes last
  EXPECT_TRUE(Got().targetXP && Got().diagnostics && Got().translateOnly && Got().rebuildAll && Got().modernCpp);
  EXPECT_FALSE(Got().defaultToDll || Got().exportPublicHeaders || Got().repackageExecutableTargets);
  EXPECT_FALSE(Got().solutionContainsPrepackagedProjects || Got().makeTranslatedFilesReadOnly);
  EXPECT_FALSE(Got().makeExportedHeaderFilesReadOnly || Got().writeTokenEquivalent);
}

TEST_F(ConfigTest, Variables) {
  Load(
      "$A = \"x\\\\y/\" $B = path \"x\\\\y/\" $C = \"$(A)!\"\n"
      "$EXPORT_LIB = \"lib\" $EXPORT_TRANSLATED_INCLUDE = \"t\" $EXPORT_UNTRANSLATED_INCLUDE = path \"u\\\\\"\n"
      "$COMPILE_FILE_PATH = \"c\\\\w/x.cpp\"");
  EXPECT_EQ(
      "$A = x\\y/\n$B = x/y\n$C = x\\y/!\n$EXPORT_LIB = lib\n$EXPORT_TRANSLATED_INCLUDE = t\n"
      "$EXPORT_UNTRANSLATED_INCLUDE = u\n$COMPILE_FILE_PATH = c\\w/x.cpp\n",
      trace);
  EXPECT_EQ("lib t u c/w/x.cpp", Got().exportLib + " " + Got().exportTranslatedInclude + " " +
                                     Got().exportUntranslatedInclude + " " + Got().compileFilePath);
}

TEST_F(ConfigTest, TargetDirectory) {
  const std::pair<std::string, const char*> kRows[] = {{"\"build/x64/Release\"", "x64|Release"},
                                                       {"path \"a/b/Win32/Debug/\"", "Win32|Debug"},
                                                       {"\"a\\\\b\\\\c\"", "b|c"},
                                                       {"\"/x/y\"", "x|y"},
                                                       {"\"x\"", "p|c"},
                                                       {"\"x/y\"", "p|c"},
                                                       {"\"/y\"", "p|c"},
                                                       {"\"\"", "p|c"}};
  for (const auto& [value, expected] : kRows) {
    Load("platform = \"p\" config = \"c\" $TARGET_DIR = " + value);
    EXPECT_EQ(expected, Got().platform + "|" + Got().config) << value;
  }
}

TEST_F(ConfigTest, Environments) {
  Load(
      "PATH(\"W\") = { \"a\" \"b\" } PATH(\"W\") += { \"c\" } INCLUDE(\"W\") += { \"\" \"i\" } LIB(\"W\") = { \"l\" }\n"
      "LIB(\"W\") = { } PATH(\"V\") = { }");
  const PlatformEnvironment& environment = Got().platformEnvironments.at("W");
  EXPECT_EQ("a;b;c|i|", environment.PATH + "|" + environment.INCLUDE + "|" + environment.LIB);
  EXPECT_EQ(2u, Got().platformEnvironments.size());
  EXPECT_EQ(nullptr, Got().Environment());
  Got().platform = "W";
  EXPECT_EQ(&environment, Got().Environment());
}

TEST_F(ConfigTest, Launcher) {
  using Words = std::vector<std::string>;
  for (const auto& [value, words] :
       std::initializer_list<std::pair<const char*, Words>>{{"\"c c\"", {"c c"}},
                                                            {"{ \"a\" \"$(config)x\" }", {"a", "x"}},
                                                            {"\"a\" launcher = \"\"", {}},
                                                            {"{ }", {}}}) {
    Load("$config = \"\" launcher = " + std::string(value));
    EXPECT_EQ(words, Got().launcher) << value;
  }
}

TEST_F(ConfigTest, Messages) {
  for (const auto& [name, text, message] : TextCasesOf("driver/cases/config_messages.txt")) {
    AssertFails(text, "\nmain.qrex" + message + "\n");
  }
  for (const std::string path : {"none", "\xFF"}) {
    AssertFails("@import \"" + path + "\"", "\nmain.qrex(1) : Couldn't open file " + path +
                                                "\n    while processing qrex config file : main.qrex\n");
  }
  EXPECT_FALSE(LoadConfiguration(Got(), "none.qrex", ""));
  EXPECT_FALSE(LoadConfiguration(Got(), ".", ""));
  EXPECT_EQ("Exception: Couldn't open file none.qrex\nException: Couldn't open file .\n",
            trace.substr(trace.find("Exception")));
}

TEST_F(ConfigTest, Imports) {
  Write("inc/one", "@def m = x\nconfig = \"one\"\n@import \"two\"");
  Write("inc/two", "platform = \"two\" config = \"_m_\"");
  Load("config = \"main\"\n@importpath \"inc\"\n@import \"one\"\nmode = gen");
  EXPECT_EQ("two|_m_", Got().platform + "|" + Got().config);
  EXPECT_EQ(RunMode::Gen, Got().mode);
  Write("bad", "\nmode = bad");
  AssertFails("\n\n@import\n\"bad\"",
              "\nbad(2) : Invalid option : bad\n\nmain.qrex(3) : while processing @import of bad\n");
}

// What is missing, step by step; the last addition counts.
TEST_F(ConfigTest, Validation) {
  std::string text;
  for (const auto& [name, addition, message] : TextCasesOf("driver/cases/validation.txt")) {
    text += addition + "\n";
    Load(text);
    EXPECT_EQ(message.empty() ? "" : "\n" + message + "\n", ValidateSettings(Got())) << addition;
  }
}

TEST_F(ConfigTest, PathSyntax) {
  EXPECT_TRUE(CheckPathSyntax(settings));
  settings.workspaces = {"w", "\xFF"};
  EXPECT_FALSE(CheckPathSyntax(settings));
  settings.workspaces = {"w", "a/", "b\\"};
  EXPECT_FALSE(CheckPathSyntax(settings));
  settings.exportUntranslatedInclude = "u\\";
  EXPECT_FALSE(CheckPathSyntax(settings));
  settings.virtualTree = {"t\\/"};
  EXPECT_FALSE(CheckPathSyntax(settings));
  EXPECT_EQ(
      "No valid UTF-8 in argument \xFF\nPath can't end with a trailing slash in argument a/\nForward slashes must be "
      "used in argument u\\\n"
      "Forward slashes must be used in argument t\\/\n",
      trace);
}

TEST_F(ConfigTest, WorkspaceRoot) {
  Write("w/.qrwsroot", "");
  Write("w/sub/.qrwsroot", "");
  std::string root, relative;
  EXPECT_TRUE(FindWorkspaceRoot("w/sub/a/x.cpp", root, relative));
  EXPECT_EQ("w/sub|a/x.cpp", root + "|" + relative);
  EXPECT_TRUE(FindWorkspaceRoot("w/x.cpp", root, relative));
  EXPECT_EQ("w|x.cpp", root + "|" + relative);
  for (const char* path : {"x.cpp", "none/x.cpp", "/x.cpp", "w\\x.cpp", ""}) {
    EXPECT_FALSE(FindWorkspaceRoot(path, root, relative)) << path;
  }
}

// A run that loops, and one that sets itself a bound below that and uses the other's names as plain words.
TEST_F(ConfigTest, RunsInOneProcessDoNotMeet) {
  const std::string loop = "@let int i = 0\n@while (i < 20) {@let i = i + 1\n}";
  const auto load = [&](ConfigSettings& run, const std::string& name, const std::string& text) {
    Write(name + "/app/src/" + name + ".qrpj",
          "$TARGET_TYPE = \"Application\" $ROOT_TO_PROJDIR = \"app\" qrex config { \"Debug|x64\" }\n{ \"" + name +
              ".h\" }");
    Write(name + "/app/" + name + ".h", text);
    Write(name + ".qrex", "virtualTree = { \"" + name + "\" } workspaces = { \"app/src/" + name +
                              ".qrpj\" }\n$EXPORT_LIB = \"lib\" $EXPORT_TRANSLATED_INCLUDE = \"t\"\n"
                              "$EXPORT_UNTRANSLATED_INCLUDE = \"u\" config = \"Debug\" platform = \"x64\"\n"
                              "translateOnly = true rebuildAll = true");
    ASSERT_TRUE(LoadConfiguration(run, name + ".qrex", "")) << trace;
  };
  const auto translated = [](const std::string& name) { return Read("qrexsource/x64/Debug/app/" + name + ".h"); };
  ConfigSettings first, second;
  load(first, "first", "@def answer = 42\n" + loop + "int a = answer;\n");
  load(second, "second", "int a = answer;\n");
  second.macroWorld.limits.iterations = 10;
  EXPECT_TRUE(RunWorkspace(second)) << trace;
  EXPECT_TRUE(RunWorkspace(first)) << trace;
  EXPECT_FALSE(second.macroWorld.names.MayHold("answer"));
  EXPECT_TRUE(RunWorkspace(second)) << trace;
  EXPECT_NE(std::string::npos, translated("first").find("int a = 42;")) << translated("first");
  EXPECT_NE(std::string::npos, translated("second").find("int a = answer;")) << translated("second");
  Write("second/app/second.h", loop);
  EXPECT_FALSE(RunWorkspace(second));
  EXPECT_NE(std::string::npos, trace.find("Too many iterations in @while directive")) << trace;
}

}  // namespace
}  // namespace qrex
