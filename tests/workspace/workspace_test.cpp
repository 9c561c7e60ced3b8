// Workspace files, the graph of projects, identifiers, file lists, and the description that a project exports.

#include "driver/run_workspace.h"
#include "generators/exported_project.h"
#include "text/guid.h"
#include "world_fixture.h"

namespace qrex {
namespace {

// What `work` writes to standard output.
template <typename Work>
std::string Printed(Work work) {
  ::testing::internal::CaptureStdout();
  work();
  return ::testing::internal::GetCapturedStdout();
}

class WorkspaceFileTest : public WorldTest {
 protected:
  // What the whole run writes, timing lines and project headings left out.
  std::string Run(const std::string& text, bool succeeds) {
    trace.clear();
    Write("tree/all.qrws", text);
    settings.workspaces = {"all.qrws"};
    settings.mode = RunMode::Clean;
    EXPECT_EQ(succeeds, RunWorkspace(settings)) << text;
    const std::string opening = "Cleaning workspace [all.qrws]\n";
    EXPECT_EQ(opening, trace.substr(0, opening.size()));
    return trace.substr(opening.size(), trace.find("\nCompleted") - opening.size());
  }
  void AssertError(const std::string& text, const std::string& message) {
    EXPECT_EQ(message, Run(text, false)) << text;
  }
};

TEST_F(WorkspaceFileTest, Tree) {
  settings.virtualTree = {"tree", "more"};
  for (const char* name : {"base", "app", "ui", "deep"}) WriteProject(name, "{ }");
  Write("tree/sub/more.QRWS", "@import \"common.inc\" \"dropped\" { later } behind }");
  Write("more/common.inc", "@def later = \"deep\"\n \"ui\"");
  Write("tree/all.qrws", "\"all\" { \"base\" \"app\" { \"base\" \"ui/src/ui.qrpj\" \"sub/more.QRWS\" } } behind");
  settings.workspaces = {"all.qrws"};
  settings.mode = RunMode::Gen;
  EXPECT_TRUE(RunWorkspace(settings)) << trace;
  EXPECT_EQ("base ui app deep", Read("all.projects"));  // the nested file's project has no parent
  EXPECT_EQ(Read("tree/sub/more.QRWS"), Read("uinc/sub/more.QRWS"));
  EXPECT_EQ(Read("tree/all.qrws"), Read("uinc/all.qrws"));
}

TEST_F(WorkspaceFileTest, Messages) {
  WriteProject("app", "{ }");
  Write("tree/bad.qrws", "\"b\"\n{ x }");
  Write("tree/macro.qrws", "\n@else");
  for (const auto& [text, message] : std::initializer_list<std::pair<const char*, const char*>>{
           {"all", "(1) : Expected double quoted string when read all"},
           {"\"all\" {\n\"a\\\\b\" }", "(2) : Forward slashes must be used in \"a\\\\b\""},
           {"\"all\" {\n\"none.qrws\"\n}", "(2) : Couldn't open workspace file none.qrws"},
       }) {
    AssertError(text, std::string("\ntree/all.qrws") + message + "\n");
  }
  AssertError("\"all\" {\n\n\"bad.qrws\" }",
              "\ntree/bad.qrws(2) : Expected double quoted string when read x\n"
              "\ntree/all.qrws(3) : while reading workspace file bad.qrws\n");
  AssertError("\"all\" { \"b.cpp\"\n}",
              "Error: Couldn't open project file b.cpp/src/b.cpp.qrpj\n"
              "\ntree/all.qrws(1) : while reading project file b.cpp/src/b.cpp.qrpj\n");
  EXPECT_NE(std::string::npos, Run("\"all\" {\n\"macro.qrws\" }", false)
                                   .find("\n\ntree/all.qrws(2) : Error in workspace file tree/macro.qrws\n"))
      << trace;
  EXPECT_EQ("", Run("\"all\" { }", true));
}

class GraphTest : public WorldTest {
 protected:
  // The names of the projects in their order.
  std::string ProjectNames() const {
    std::string names;
    for (const auto& project : workspace->projects) names += (names.empty() ? "" : " ") + project->name;
    return names;
  }
  std::string Sort() {
    return Printed([&] { workspace->SortProjects(); });
  }
  Project& Named(const char* name) { return *workspace->FindProjectByName(name); }
};

TEST_F(GraphTest, Order) {
  WriteProject("a", "subproj { \"c\" \"b\" } { }");
  WriteProject("b", "subproj { \"d\" } { }");
  WriteProject("c", "subproj { \"d\" } { }");
  WriteProject("d", "{ }");
  WriteProject("e", "{ }");
  Load({"e", "a", "d", "a"});
  EXPECT_EQ("e a c d b", ProjectNames());
  EXPECT_EQ("", Sort());
  EXPECT_EQ("e d c b a", ProjectNames());
  EXPECT_EQ(&Named("c"), workspace->FindSubproject("other/c.x.qrpj") ? nullptr : workspace->FindSubproject("x/c.qrpj"));
  EXPECT_EQ(nullptr, workspace->FindSubproject("x/C.qrpj"));
}

TEST_F(GraphTest, CyclesAndMissingSubprojects) {
  WriteProject("a", "subproj { \"b\" } { }");
  WriteProject("b", "subproj { \"a\" \"x/alias.qrpj\" } { }");
  Write("tree/x/alias.qrpj", "$TARGET_TYPE = \"Application\" $ROOT_TO_PROJDIR = \"x/real\" { }");
  Load({"a"});
  EXPECT_EQ("*** Warning : cycle detected involving project a\n*** Warning : Subproject alias not found\n", Sort());
  EXPECT_EQ("b a real", ProjectNames());
  EXPECT_EQ("", trace);
  // a file that names itself under a name that is not its project's ends at a bound
  Write("tree/x/alias.qrpj",
        "$TARGET_TYPE = \"Application\" $ROOT_TO_PROJDIR = \"x/real\" subproj { \"x/alias.qrpj\" } { }");
  Load({});
  EXPECT_EQ(nullptr, workspace->LoadProject("x/alias.qrpj"));
  EXPECT_EQ("Error: Subprojects nested too deeply at x/alias.qrpj\n", trace);
}

TEST_F(GraphTest, LoadsThatFail) {
  WriteProject("a", "subproj { \"none\" \"b\" } { }");
  WriteProject("b", "{ }");
  Load({"a", "b"});
  EXPECT_EQ("Error: Couldn't open project file none/src/none.qrpj\n", trace);
  EXPECT_EQ("a  b", ProjectNames());  // the empty one stays
  trace.clear();
  EXPECT_FALSE(Named("a").AddSubproject("B/src/b.QRPJ"));
  EXPECT_TRUE(Named("a").AddSubproject("c.qrpj"));
  EXPECT_EQ("*** Warning: project a already has subproject B/src/b.QRPJ\n", trace);
}

// The run goes on without it; what an earlier one wrote of it stays.
TEST_F(GraphTest, AFileWithAnErrorBehindItsHeads) {
  WriteProject("lib", "subproj { \"app\" } qrex { \"a.h\" : frob }");
  WriteProject("app", "qrex subproj { \"lib\" } { \"b.h\" }");
  Write("tree/lib/a.h", "int a;\n");
  Write("tree/app/b.h", "int b;\n");
  Write("lib.cbp", "old");
  settings.workspaces = {"lib", "app"};
  for (const RunMode mode : {RunMode::Gen, RunMode::Build, RunMode::Clean}) {
    trace.clear();
    settings.mode = mode;
    EXPECT_TRUE(RunWorkspace(settings)) << trace;
    EXPECT_NE(std::string::npos, trace.find("\ntree/lib/src/lib.qrpj(4) : Unknown option : frob\n")) << trace;
  }
  EXPECT_EQ("old", Read("lib.cbp"));
  EXPECT_FALSE(FileExists("uinc/lib/src/lib.qrpj"));
  EXPECT_FALSE(FileExists("qrexsource/x64/Debug/lib/a.h"));
  EXPECT_TRUE(FileExists("uinc/app/src/app.qrpj") && FileExists("app.cbp"));
}

TEST_F(WorkspaceFileTest, NestedFiles) {
  const auto name = [](int i) { return "w" + std::to_string(i) + ".qrws"; };
  for (int i = 1; i < 1001; ++i) Write("tree/" + name(i), "\"w\" { \"" + name(i + 1) + "\" }");
  Write("tree/" + name(999), "\"w\" { }");
  EXPECT_EQ("", Run("\"all\" { \"w1.qrws\" }", true));  // 1,000 with the outermost
  Write("tree/" + name(999), "\"w\" { \"w1000.qrws\" }");
  const std::string message = "\ntree/w999.qrws(1) : Workspace files nested too deeply\n";
  EXPECT_EQ(message, Run("\"all\" { \"w1.qrws\" }", false).substr(0, message.size()));
}

TEST_F(GraphTest, Identifiers) {
  WriteProject("a", "{ }");
  WriteProject("b", "{ }");
  Load({"b", "a"});
  const guid made = Named("b").guid;
  guid stored;
  for (size_t i = 0; i < 16; ++i) stored.bytes[i] = static_cast<uint8_t>(0xF0 + i);
  const std::string bytes(stored.bytes.begin(), stored.bytes.end()), madeBytes(made.bytes.begin(), made.bytes.end());
  Write("projects.guids", std::string("\x02\x01") + "a" + bytes + "\x04" + "gone" + bytes);
  workspace->SyncProjectGuids();
  EXPECT_TRUE(Named("a").guid == stored && Named("b").guid == made);
  EXPECT_EQ(std::string("\x03\x01") + "a" + bytes + "\x01" + "b" + madeBytes + "\x04" + "gone" + bytes,
            Read("projects.guids"));
  EXPECT_EQ("", trace);
  for (size_t length = 1; length < 10; ++length) {
    trace.clear();
    Write("projects.guids", (std::string("\x01\x03") + "abc" + bytes).substr(0, length));
    workspace->SyncProjectGuids();
    EXPECT_EQ("Error reading projects.guids : Deserialisation error\n", trace) << length;
    EXPECT_EQ(std::string("\x02\x01") + "a" + bytes + "\x01" + "b" + madeBytes, Read("projects.guids"));
  }
}

TEST_F(GraphTest, FileLists) {
  WriteProject(
      "app",
      "{ \"app.cpp\" \"z.cpp\" \"m.asm\" \"n.txt\" \"no.h\" : exclude \"p1.cpp\" : +cpp { /Yc\"p.h\" }\n"
      "\"src\" { \"a.h\" \"p2.cpp\" : +cpp { /Yc\"p.h\" } \"deep\" { \"d.c\" \"a.cpp\" } \"k.cpp\" \"l.asm\" } \"o\" "
      "{ \"a.h\" \"app.cpp\" } }");
  settings.compiler = CompilerKind::vc9;
  Load({"app"});
  EXPECT_TRUE(workspace->CheckFileReferences());
  std::string files, folders;
  for (const ProjectFile* file : Named("app").files) files += file->path + " ";
  for (const ProjectFolder* folder : Named("app").folders) folders += folder->name + " ";
  EXPECT_EQ("deep src o app ", folders);
  EXPECT_EQ(
      "app/src/deep/d.c app/src/a.h app/o/a.h app/n.txt app/p1.cpp app/src/p2.cpp app/src/deep/a.cpp app/src/k.cpp "
      "app/z.cpp app/app.cpp app/src/l.asm app/m.asm ",
      files);
  EXPECT_EQ("Warning : Project app has repeated filename a.h\nWarning : Project app has repeated filename app.cpp\n",
            trace);
  ProjectFile& source = *workspace->FindFile("app/src/deep/a.cpp");
  EXPECT_EQ("app/o/a.h", source.pairedHeader->path);
  EXPECT_EQ(&source, workspace->FindFile("app/src/a.h")->pairedSource);
  EXPECT_EQ("app/o/a.h", Named("app").filesByName.at("a.h")->path);
  EXPECT_EQ(nullptr, workspace->FindFile("app/no.h"));
}

TEST_F(GraphTest, References) {
  WriteProject("a", "{ \"../s\" { \"x.h\" } \"y.h\" }");
  WriteProject("b", "{ \"../s\" { \"x.h\" } }");
  WriteProject("c", "{ \"../s\" { \"x.h\" : exclude } }");
  Load({"a", "c"});
  EXPECT_TRUE(workspace->CheckFileReferences());
  Load({"b", "c", "a"});
  EXPECT_FALSE(workspace->CheckFileReferences());
  EXPECT_EQ("ERROR:  Projects b and a both reference file s/x.h\n", trace);
}

TEST_F(GraphTest, DefinesOfStaticLibraries) {
  WriteProject("Lib", "Static Library", "{ }");
  WriteProject("lib2", "Static Library", "subproj { \"Lib\" } { }");
  WriteProject("app", "subproj { \"lib2\" } { }");
  Load({"app"});
  EXPECT_TRUE(workspace->CheckFileReferences());
  auto defines = [&](const char* name) { return Named(name).configs[0]->compilerOptions["PreprocessorDefinitions"]; };
  EXPECT_EQ("lib2_STATIC_LIBRARY|lib2_STATIC_LIBRARY;Lib_STATIC_LIBRARY|Lib_STATIC_LIBRARY",
            defines("app") + "|" + defines("lib2") + "|" + defines("Lib"));
}

TEST_F(GraphTest, ExportedDescription) {
  WriteProject("base", "{ }");
  Write("tree/libs/app/src/app.qrpj",
        "$TARGET_TYPE = \"Static Library\" $ROOT_TO_PROJDIR = \"libs/app\" qrex\n"
        "config { \"Debug|x64\" [\"fast\" \"two words\"] \"Release|x64\" }\nsubproj { \"base\" }\n"
        "{ \"a.h\" \"no.h\" : exclude \"b.h\" as \"B.h\" \"src\" { \"x.cpp\" } \"pub\" { \"c.h\" \"src\" { \"d.h\" } } "
        "}");
  Load({"libs/app"});
  WriteExportedProject(Named("app"));
  EXPECT_EQ(
      "$TARGET_TYPE = \"Static Library\"\r\n$ROOT_TO_PROJDIR = \"libs/app\"\r\nexport\r\nqrex\r\n\r\n"
      "config\r\n{\r\n    \"Debug|x64\" [\"fast\" \"two words\"]\r\n    \"Release|x64\"\r\n}\r\n\r\n"
      "subproj\r\n{\r\n    \"base\"\r\n}\r\n\r\n"
      "+link\r\n{\r\n    /OUT:\"$(EXPORT_LIB)/$(CONFIG)/$(PROJNAME).$(TGT_EXTENSION)\"\r\n}\r\n\r\n"
      "{\r\n    \"pub\"\r\n    {\r\n        \"src\"\r\n        {\r\n            \"d.h\"\r\n        }\r\n"
      "        \"c.h\"\r\n    }\r\n    \"a.h\"\r\n    \"B.h\"\r\n}\r\n",
      Read("uinc/libs/app/src/app.qrpj"));
  WriteExportedProject(Named("app"));
  EXPECT_EQ("Writing uinc/libs/app/src/app.qrpj\nSkipping uinc/libs/app/src/app.qrpj\n", trace);
  settings.virtualTree = {"uinc", "tree"};  // and it is a project file itself
  Load({"libs/app"});
  EXPECT_TRUE(Named("app").exported && Named("app").usesQrex);
  EXPECT_EQ("fast", Named("app").configs.at(0)->tags.at(0));
  EXPECT_EQ(3u, Named("app").rootFolder.files.size() + Named("app").rootFolder.subfolders.size());
}

}  // namespace
}  // namespace qrex
