// Project files: the model that comes of each statement and of the file tree, and every message.

#include <fstream>

#include "text/output_policy.h"
#include "text_cases.h"
#include "workspace/file_filter.h"
#include "world_fixture.h"

namespace qrex {
namespace {

constexpr char kHeads[] = "$TARGET_TYPE = \"Console Application\"\n$ROOT_TO_PROJDIR = \"app\"\n";
constexpr char kConfigs[] = "config { \"Debug|x64\" \"Release|x64\" [\"fast\" \"small\"] \"Debug|Win\" }\n";

// Files, then subfolders. A file is its path, with its display name behind `=` where that differs, and `-` when
// excluded.
std::string Printed(const ProjectFolder& folder) {
  std::string text;
  for (const ProjectFile* file : folder.files) {
    text += text.empty() ? "" : " ";
    text += (file->excluded ? "-" : "") + file->path;
    const size_t slash = file->path.rfind('/');
    if (file->name != file->path.substr(slash + 1)) text += "=" + file->name;
  }
  for (const auto& subfolder : folder.subfolders) {
    text += (text.empty() ? "" : " ") + subfolder->name + "{" + Printed(*subfolder) + "}";
  }
  return text;
}

std::string Printed(const OptionMap& options) {
  std::string text;
  for (const auto& [name, value] : options) text += name + "=" + value + ";";
  return text;
}

class ProjectTest : public WorldTest {
 protected:
  ProjectTest() { settings.virtualTree = {"tree", "more"}; }

  Project* TryLoad(const std::string& text) {
    trace.clear();
    Write("tree/app/src/app.qrpj", text);
    return World::Load({"app"}) ? &App() : nullptr;
  }
  Project& Load(const std::string& text) {
    EXPECT_TRUE(TryLoad(text)) << text << trace;
    return App();
  }
  void AssertTree(const std::string& tree, const std::string& expected) {
    EXPECT_EQ(expected, Printed(Load(kHeads + tree).rootFolder)) << tree;
  }
  // Per configuration what `print` makes of it, one line each.
  template <typename Print>
  std::string OfConfigs(const std::string& statements, Print print) {
    std::string text;
    for (const auto& config : Load(std::string(kHeads) + kConfigs + statements + "{ }").configs) {
      text += config->name + "|" + config->platform + ":" + print(*config) + "\n";
    }
    return text;
  }
  void AssertError(const std::string& text, const std::string& message) {
    EXPECT_EQ(nullptr, TryLoad(text)) << text;
    EXPECT_EQ("\ntree/app/src/app.qrpj" + message + "\n", trace) << text;
  }
};

TEST_F(ProjectTest, Heads) {
  const struct {
    const char* type;
    TargetType expected;
    bool isStatic;
    const char* extension;
  } kRows[] = {
      {"Application", TargetType::Application, false, "exe"},
      {"Static Library", TargetType::StaticLibrary, false, "lib"},
      {"Console Application", TargetType::ConsoleApplication, false, "exe"},
      {"Dynamic-Link Library", TargetType::DynamicLinkLibrary, false, "dll"},
      {"Utility Project", TargetType::UtilityProject, false, "???"},
      {"Library", TargetType::StaticLibrary, true, "lib"},
  };
  settings.defaultToDll = false;
  for (const auto& row : kRows) {
    const Project& project = Load("$TARGET_TYPE = \"" + std::string(row.type) +
                                  "\" $ROOT_TO_PROJDIR = \"a/b/c\" { \"\" as \"$(TARGET_TYPE)|$(TGT_EXTENSION)|"
                                  "$(PROJNAME)|$(ROOT_TO_PROJDIR)|$(PROJDIR_TO_ROOT)\" { } }");
    EXPECT_EQ(row.expected, project.targetType);
    EXPECT_EQ(row.isStatic, project.libraryIsStatic);
    EXPECT_EQ(std::string(row.type) + "|" + row.extension + "|c|a/b/c|../../..{}", Printed(project.rootFolder));
    EXPECT_EQ("c a/b/c/src a_b_c",
              project.name + " " + project.sourceDir + " " + workspace->projects[0]->MangledProjDir());
    EXPECT_EQ("c", project.rootFolder.name);
    EXPECT_EQ("tree tree/app/src/app.qrpj", project.rootDir + " " + project.filePath);
  }
  settings.defaultToDll = true;
  const Project& project =
      Load("$TARGET_TYPE = \"Library\" $ROOT_TO_PROJDIR = \"app\" $PROJDIR_TO_ROOT = \"\" qrex export { }");
  EXPECT_EQ(TargetType::DynamicLinkLibrary, project.targetType);
  EXPECT_EQ("", project.projDirToRoot);
  EXPECT_TRUE(project.usesQrex && project.exported && !project.libraryIsStatic);
}

TEST_F(ProjectTest, Configurations) {
  EXPECT_EQ("Debug|x64:\nRelease|x64:fast,small,\nDebug|Win:\nlate|p:t,\n",
            OfConfigs("$A = \"t\" config { \"late|p\" [\"$(A)\"] }", [](const ProjectConfig& config) {
              std::string tags;
              for (const std::string& tag : config.tags) tags += tag + ",";
              return tags;
            }));
  EXPECT_EQ("$A = t\n", trace);
}

TEST_F(ProjectTest, ScopesAndRawBlocks) {
  for (const auto& [name, statements, expected] : TextCasesOf("workspace/cases/scopes.txt")) {
    EXPECT_EQ(expected + "\n", OfConfigs(statements, [](const ProjectConfig& config) { return config.compilerText; }))
        << statements;
  }
  EXPECT_EQ("Debug|x64: -a -b\nRelease|x64: -a\nDebug|Win: -a -b\n",
            OfConfigs("+link { -a } -link (\"Debug\") { -b }",
                      [](const ProjectConfig& config) { return config.linkerText; }));
}

// A block for another compiler holds tokens up to its bracket, in whatever form that compiler wants its switches.
TEST_F(ProjectTest, BlocksForOtherCompilers) {
  const std::string statements =
      "+cpp (\"gcc\", \"clang|Debug\") { -std=c++17 -D'a}' } +cpp (\"vc9\", \"vc14|x64\") { /O2 /GR- }\n"
      "-cpp (\"vc9|Debug\") { /GR } -cpp (\"gcc\") { /GS } +rc (\"gcc\") { -x } +link (\"gcc\") { -lm } ";
  const auto print = [](const ProjectConfig& config) {
    return config.compilerText + "|" + Printed(config.compilerOptions) + "|" + config.linkerText;
  };
  const std::string gccBlocks = statements.substr(0, statements.find("+rc"));
  EXPECT_EQ("Debug|x64: -std=c++17 -D'a}'||\nRelease|x64: -std=c++17 -D'a}'||\nDebug|Win: -std=c++17 -D'a}'||\n",
            OfConfigs(gccBlocks, print));
  settings.compiler = CompilerKind::vc9;
  const char* const kOptimised = "|Optimization=2;RuntimeTypeInfo=false;|\n";
  EXPECT_EQ(std::string("Debug|x64:|Optimization=2;|\nRelease|x64:") + kOptimised + "Debug|Win:|Optimization=2;|\n",
            OfConfigs(statements, print));
  const Project& project = Load(std::string(kHeads) + kConfigs +
                                "{ \"a.cpp\" : +cpp (\"gcc\") { -w }, -cpp (\"vc6\") { -g }, exclude (\"vc9|Win\") }");
  EXPECT_EQ(1u, project.filesByPath.at("app/a.cpp")->configRecords.size());

  // What could be meant for this compiler is read.
  for (const auto& [scope, expected] :
       std::initializer_list<std::pair<const char*, bool>>{{"\"gcc\"", true},
                                                           {"\"gcc|none\", \"vc8\"", true},
                                                           {"\"gcc\", \"none\"", false},
                                                           {"\"vc9|none\"", false},
                                                           {"\"none\"", false},
                                                           {"\"gcc\", \"vc9\"", false}}) {
    const std::string block = " +cpp (" + std::string(scope) + ") { -w } { }";
    EXPECT_EQ(expected, TryLoad(std::string(kHeads) + kConfigs + block) != nullptr) << scope;
    // A tag may have the name of a compiler.
    EXPECT_EQ(nullptr, TryLoad(std::string(kHeads) + "config { \"a|b\" [\"gcc\" \"vc8\"] }" + block)) << scope;
  }
  AssertError(std::string(kHeads) + "+cpp (\"gcc\") -w", "(3) : Expected '{' when read -");
  AssertError(std::string(kHeads) + "+cpp (\"gcc\") { -w", "(3) : Expected '}' when read -");

  // What can be read is, with its warnings.
  trace.clear();
  Load(std::string(kHeads) + kConfigs + "+cpp (\"vc14\") { /Fr } -cpp (\"vc6\") { /H\"1\" } { }");
  EXPECT_EQ("warning: Compiler switch /Fr is deprecated\nwarning: Compiler switch /H is deprecated\n", trace);
}

TEST_F(ProjectTest, OptionsOfConfigurations) {
  settings.compiler = CompilerKind::vc9;
  EXPECT_EQ(
      "Debug|x64:PreprocessorDefinitions=A;P_x64;|\nRelease|x64:PreprocessorDefinitions=A;B;P_x64;|\n"
      "Debug|Win:PreprocessorDefinitions=A;P_Win;|\n",
      OfConfigs(
          "+cpp { /D \"A\" /D \"B\" /D \"P_$(PLATFORM)\" } -cpp (\"Debug\") { /D \"B\" }",
          [](const ProjectConfig& config) { return Printed(config.compilerOptions) + "|" + config.compilerText; }));
  EXPECT_EQ(
      "Debug|x64:CharacterSet=2;OutputDirectory=o/x64;\nRelease|x64:OutputDirectory=o/"
      "x64;\nDebug|Win:CharacterSet=2;OutputDirectory=o/Win;\n",
      OfConfigs("general { OutputDirectory = 'o/$(PLATFORM)' } general (\"Debug\") { CharacterSet = \"1\" CharacterSet "
                "= \"2\" }",
                [](const ProjectConfig& config) { return Printed(config.generalOptions); }));
  EXPECT_EQ("Debug|x64:d/c|/\nRelease|x64:/|e/f\nDebug|Win:d/c|/\n",
            OfConfigs("prebuildevent (\"Debug\") { \"d\" 'c' } postbuildevent (\"Release\") { \"e\" \"f\" }",
                      [](const ProjectConfig& config) {
                        EXPECT_FALSE(config.preLinkEvent.present);
                        EXPECT_EQ(config.name == "Debug", config.preBuildEvent.present);
                        return config.preBuildEvent.description + "/" + config.preBuildEvent.commandLine + "|" +
                               config.postBuildEvent.description + "/" + config.postBuildEvent.commandLine;
                      }));
}

TEST_F(ProjectTest, KindsOfFiles) {
  const Project& project = Load(std::string("$TARGET_TYPE = \"Static Library\" $ROOT_TO_PROJDIR = \"app\"") +
                                "{ \"app.CPP\" \"p.h\" \"src\" { \"q.H\" \"r.Py\" \".x\" \"noext\" } }");
  std::string kinds;
  for (const auto& [path, file] : project.filesByPath) {
    kinds += std::string(path) + " " + file->stem + " " + file->extension + " " +
             std::to_string(static_cast<int>(file->kind)) + (file->isMainSource ? " main" : "") +
             (file->isPublicHeader ? " public\n" : "\n");
  }
  EXPECT_EQ(
      "app/app.CPP app cpp 2 main\napp/p.h p h 3 public\napp/src/.x .x x 0\napp/src/noext noext  0\napp/src/q.H q h 3\n"
      "app/src/r.Py r py 8\n",
      kinds);
}

// Searches, and names that are given to files and folders.
TEST_F(ProjectTest, Trees) {
  for (const char* path : {"tree/app/a.h", "tree/app/b.cpp", "tree/app/.hid.h", "tree/app/s/c.h", "tree/app/s/t/d.H",
                           "tree/app/u/e.txt", "more/app/f.h", "more/app/s/g.h", "more/app/v/w/h.h"}) {
    Write(path, "");
  }
  for (const auto& [name, tree, expected] : TextCasesOf("workspace/cases/project_trees.txt"))
    AssertTree(tree, expected);
  // Above the roots lies the folder of the run.
  Write("here.h", "");
  AssertError(std::string(kHeads) + "{ \"../..\" { \"*.h\" } }", "(3) : Path leads out of the tree : ..");
  settings.virtualTree = {"tree", "."};
  AssertTree("{ \"..\" { \"h*.h\" } }", "${here.h}");
  settings.virtualTree = {"tree", "more"};
#ifndef _WIN32  // where names are UTF-16
  std::ofstream("tree/app/s/\xFF.txt");
  AssertTree("{ \"*.cpp\" * }", "app/b.cpp");
  AssertError(std::string(kHeads) + "{ \"*\" * }", "(3) : Path is not valid UTF-8 : app/s/\xFF.txt");
#endif
}

TEST_F(ProjectTest, Patterns) {
  EXPECT_TRUE(MatchesPattern("abc.H", "*.h") && MatchesPattern("a", "?") && MatchesPattern("", "*"));
  EXPECT_TRUE(MatchesPattern("aXbXc", "a*b*c") && MatchesPattern("aab", "*ab") && MatchesPattern("x", "***x**"));
  EXPECT_FALSE(MatchesPattern("abc", "ab") || MatchesPattern("ab", "abc") || MatchesPattern("", "?"));
  EXPECT_FALSE(MatchesPattern(std::string(5000, 'a'), std::string(2000, '*') + "b"));
}

TEST_F(ProjectTest, OptionsOfFiles) {
  auto records = [](const Project& project, const std::string& path) {
    std::string text;
    for (const auto& record : project.filesByPath.at(path)->configRecords) {
      text += record->config->name + "|" + record->config->platform + (record->excluded ? "-" : "") + ":" +
              record->addText + "/" + record->removeText + "/" + Printed(record->options) + "\n";
    }
    return text;
  };
  const std::string tree = "{ \"a.cpp\" : exclude (\"Win\"), +cpp (\"Debug\") { A$(CONFIG) }, -cpp (\"fast\") { B } }";
  EXPECT_EQ("Debug|Win-: ADebug//\nDebug|x64: ADebug//\nRelease|x64:/ B/\n",
            records(Load(std::string(kHeads) + kConfigs + tree), "app/a.cpp"));
  settings.compiler = CompilerKind::vc9;
  EXPECT_EQ("Debug|x64://PreprocessorDefinitions=M_x64;\nRelease|x64://PreprocessorDefinitions=M_x64;\n",
            records(Load(std::string(kHeads) + kConfigs + "{ \"a.cpp\" : +cpp (\"x64\") { /D \"M_$(PLATFORM)\" } }"),
                    "app/a.cpp"));
  Write("tree/app/two.c", "");
  Write("more/app/two.c", "");
  EXPECT_EQ("Release|x64://AdditionalOptions=/MP;\n",
            records(Load(std::string(kHeads) + kConfigs + "{ \"*.c\" : +cpp (\"Release\") { /MP } }"), "app/two.c"));
}

TEST_F(ProjectTest, Messages) {
  for (const auto& [name, text, message] : TextCasesOf("workspace/cases/project_messages.txt"))
    AssertError(text, message);
  AssertError("$TARGET_TYPE = \"Library\"\n$ROOT_TO_PROJDIR = \"../app\" { }",
              "(2) : Path leads out of the tree : ../app");
}

TEST_F(ProjectTest, Imports) {
  Write("more/inc", "@def all = \"*.h\" *\nconfig { \"c|p\" }\ndirectories - \"s\"");
  Write("tree/app/s/a.h", "");
  Write("tree/app/a.h", "");
  const Project& project = Load(std::string(kHeads) + "@import \"inc\"\n{ all }");
  EXPECT_EQ(1u, project.configs.size());
  EXPECT_EQ("app/a.h", project.rootFolder.files.back()->path);
  Write("more/inc", "\nconfig { \"c\" }");
  EXPECT_EQ(nullptr, TryLoad(std::string(kHeads) + "\n@import \"inc\"\n{ }"));
  EXPECT_EQ(
      "\nmore/inc(2) : Config specifier \"c\" must be of the form name|platform\n"
      "\ntree/app/src/app.qrpj(4) : while processing @import of more/inc\n",
      trace);
  Write("more/inc", "qrex\n{ }");
  AssertError(std::string(kHeads) + "@import\n\"inc\"\n{ }", "(3) : Syntax error when read '{' in more/inc");
}

}  // namespace
}  // namespace qrex
