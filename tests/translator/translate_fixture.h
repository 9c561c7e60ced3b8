// Translates given texts: a library project of files that live in a folder of the test's own, with a host that keeps
// what the translator tells it.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <filesystem>
#include <map>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/trace.h"
#include "translator/file/translate_file.h"
#include "translator/reader/qrex_parser.h"
#include "workspace/workspace.h"

namespace qrex {

class TestHost : public TranslationHost {
 public:
  TestHost(Workspace& workspace, ProjectConfig& config) : m_workspace(workspace), m_config(config) {}
  const ConfigSettings& Settings() const override { return m_workspace.settings; }
  const ProjectConfig& Config() const override { return m_config; }
  ProjectFile* FindFile(const std::string& path) const override {
    for (const auto& project : m_workspace.projects) {
      auto found = project->filesByPath.find(path);
      if (found != project->filesByPath.end()) return found->second.get();
    }
    return nullptr;
  }
  ScannedFile& GetScannedFile(ProjectFile& file) override {
    auto& slot = m_files[file.path];
    if (!slot) slot = std::make_unique<ScannedFile>(*this, file);
    return *slot;
  }
  std::string TranslatedPath(const ScannedFile& file) const override {
    return file.file.project->rootDir + "/translated/" + file.file.path;
  }
  bool RegisterGuid(const guid& id, const std::string& owner, std::string& existing) override {
    auto [entry, isNew] = m_guids.emplace(id, owner);
    existing = entry->second;
    return isNew;
  }
  DeclarationRegistry& RegisterMap() override { return m_register; }
  DeclarationRegistry& UnregisterMap() override { return m_unregister; }
  SymbolIndex& Symbols() override { return m_symbols; }
  size_t NextFileIndex() override { return m_nextIndex++; }
  void CountWarning() override { ++warnings; }
  bool FindSourcePosition(const char* position, std::string& path, int64_t& line) const override {
    for (const auto& [name, file] : m_files) {
      TextRange text{std::string_view(file->sourceText)};
      if (text.Empty() || !text.Contains(position)) continue;
      path = file->file.path;
      line = LineOfPosition(text, position);
      return true;
    }
    return false;
  }

  int warnings = 0;

 private:
  Workspace& m_workspace;
  ProjectConfig& m_config;
  SymbolIndex m_symbols;
  std::map<std::string, std::unique_ptr<ScannedFile>> m_files;
  std::map<guid, std::string> m_guids;
  DeclarationRegistry m_register{true};
  DeclarationRegistry m_unregister{false};
  size_t m_nextIndex = 0;
};

// The world of a test is a workspace of the project `app` and the companion runtime `vxObject` with
// Vesk/vxObject/IObject.h. A file of `app` stands under app/src/ unless its name holds a slash (then under app/: of a
// library, these are the public headers). Paths in messages are printed relative to app/src/, or else to the tree.
class TranslateTest : public ::testing::Test, public TraceHook {
 protected:
  TranslateTest() {
    SetTraceHook(this);
    settings.systemName = "Linux";
    settings.platform = "x64";
    settings.config = "Debug";
    settings.compiler = CompilerKind::gcc;
    MakeWorld(TargetType::Application);
  }
  ~TranslateTest() override {
    SetTraceHook(nullptr);
    host.reset();
    std::filesystem::remove_all(m_root);
  }

  // A new world without files, in which `app` is of that kind.
  void MakeWorld(TargetType target) {
    host.reset();
    trace.clear();
    const auto& test = *::testing::UnitTest::GetInstance()->current_test_info();
    m_root = ::testing::TempDir() + "/" + test.test_suite_name() + "." + test.name();
    std::filesystem::remove_all(m_root);
    workspace = std::make_unique<Workspace>(settings);
    workspace->name = "tree";
    AddProject("app", "app", target);
    AddProject("vxObject", "Vesk/vxObject", TargetType::UtilityProject);
    AddFileTo(*workspace->projects[1], "Vesk/vxObject/IObject.h",
              "namespace vesk\n{\n$interface+ IObject\n{\n};\n$interface+ IPersistable : IObject\n{\n};\n}\n");
    host = std::make_unique<TestHost>(*workspace, *app().configs.front());
  }

  void OnTrace(std::string_view text) override { trace.append(text); }
  Project& app() { return *workspace->projects.front(); }

  static std::string PathOf(const std::string& name) {
    return (name.find('/') == std::string::npos ? "app/src/" : "app/") + name;
  }
  void AddFile(const std::string& name, const std::string& text) { AddFileTo(app(), PathOf(name), text); }
  ScannedFile& Scanned(const std::string& name) { return host->GetScannedFile(*host->FindFile(PathOf(name))); }

  // The generated text. Throws what the translation throws. A header and its .cpp must both be there before the first
  // of them is translated.
  std::string Translate(const std::string& name) {
    app().CollectFiles();
    ScannedFile& file = Scanned(name);
    LoadText(file.sourceText, file.SourcePath(), true);
    file.translated = true;
    std::string text;
    struct Target : IOutputStream {
      explicit Target(std::string& out) : out(out) {}
      void Write(const void* data, size_t n) override { out.append(static_cast<const char*>(data), n); }
      void Flush() override {}
      std::string& out;
    } target(text);
    TranslateFile(file, target);
    return text;
  }
  std::string Translate(const std::string& name, const std::string& text) {
    AddFile(name, text);
    return Translate(name);
  }

  // What comes of a header `t.h` that imports IObject.h, then holds `text`, and of its empty `t.cpp`: the text proper
  // of the one (between head and foot, without the import), and the reflection tail in the other. Makes a new world of
  // the kind that `app` has.
  struct Generated {
    std::string header, tail;
  };
  Generated TranslateHeader(const std::string& text) {
    MakeWorld(app().targetType);
    AddFile("t.h", "@import \"Vesk/vxObject/IObject.h\"\n" + text);
    AddFile("t.cpp", "@import \"t.h\"\n");
    Generated generated;
    generated.header = Translate("t.h");
    generated.tail = Translate("t.cpp");
    Cut(generated.header,
        "#pragma once\n#ifndef _app_src_t_h\n#define _app_src_t_h\n\n#include \"Vesk/vxObject/IObject.h\"\n",
        "\n#endif // include guard\n");
    Cut(generated.tail, "#include \"t.h\"\n", "");
    return generated;
  }
  // What comes of the body of a class.
  std::string Body(const std::string& body, const std::string& head = "$struct S") {
    const std::string header = TranslateHeader(head + "\n{//\n" + body + "int end;\n};\n").header;
    return Section(header, "//\n", "int end;\n");
  }
  void AssertHeader(const std::string& text, const std::string& header) {
    ASSERT_EQ(header, TranslateHeader(text).header);
  }
  // Both texts with their tables on lines.
  void AssertGenerated(const std::string& text, const std::string& header, const std::string& tail) {
    const Generated generated = TranslateHeader(text);
    ASSERT_EQ(header, Folded(generated.header));
    ASSERT_EQ(tail, Folded(generated.tail));
  }

  // What stands behind the first `begin`, up to the first `end` behind it; all the rest when `end` is empty.
  static std::string Section(const std::string& text, const std::string& begin, const std::string& end) {
    const size_t found = text.find(begin);
    if (found == std::string::npos) return "'" + begin + "' is not in:\n" + text;
    const size_t start = found + begin.size();
    return text.substr(start, end.empty() ? end.npos : text.find(end, start) - start);
  }

  // With each table of a record on one line, "static T N[] = { row, row, };", and so its operations, by their names:
  // "{ sizeof(T), 0, VariableLess, ... }".
  static std::string Folded(const std::string& text) {
    std::istringstream lines(text);
    std::string result;
    bool folding = false;
    for (std::string line; std::getline(lines, line);) {
      const size_t indent = std::min(line.find_first_not_of(' '), line.size());
      if (result.ends_with("[] =\n") || result.ends_with("[] = \n") ||
          (result.ends_with("{\n") && line.compare(indent, 7, "sizeof(") == 0)) {
        result.back() = ' ';
        folding = true;
      }
      if (folding) line.erase(0, indent);
      if (size_t name = line.find(")) vesk::"); folding && name != line.npos && line.find("Fn) (") != line.npos) {
        name += 9;
        line = line.substr(name, line.find('<', name) - name) + (line.back() == ',' ? "," : "");
      }
      folding = folding && !line.starts_with("}");
      result += line + (folding ? ' ' : '\n');
    }
    return result;
  }

  // The tail of an element of the root name space; `record` is indented. `element`: as printed, "$enum+ E".
  static std::string TailText(const std::string& element, const std::string& record) {
    return "\n//### " + element + "\nnamespace vesk { XTarget* app_GetXTarget(); }\n" + record;
  }
  // The printed form of the error that the translation of `text` raises.
  std::string ErrorOf(const std::string& name, const std::string& text) {
    try {
      std::string generated = Translate(name, text);
      return "no error, but:\n" + generated;
    } catch (const IException& exception) {
      return WithShortPaths(ExceptionText(exception));
    }
  }

  // Tables of header texts and the error that each raises, or the messages that its translation prints, in a new world
  // for each, of the kind that `app` has. The import of IObject.h stands on the first line of the text. `before` and
  // `after` stand around the text of each case.
  struct ErrorCase {
    std::string text;
    int line;
    std::string error;
  };
  struct MessageCase {
    std::string text, message;
  };
  void AssertErrors(const std::vector<ErrorCase>& cases, const std::string& before = {},
                    const std::string& after = {}) {
    for (const auto& [text, line, error] : cases) {
      SCOPED_TRACE(text);
      EXPECT_EQ("t.h(" + ToString(line) + ") : error : " + error, ErrorInNewWorld("t.h", before + text + after));
    }
  }
  void AssertMessages(const std::vector<MessageCase>& cases, const std::string& name = "t.h") {
    for (const auto& [text, message] : cases) {
      SCOPED_TRACE(text);
      const std::string error = ErrorInNewWorld(name, text);
      EXPECT_EQ("no error", error.substr(0, 8)) << error;
      EXPECT_EQ(message, Messages());
    }
  }

  std::string Messages() const { return WithShortPaths(trace); }  // all that was printed

  Project& AddProject(const std::string& name, const std::string& directory, TargetType type) {
    workspace->projects.push_back(std::make_unique<Project>(*workspace));
    Project& project = *workspace->projects.back();
    project.name = name;
    project.rootFolder.name = name;
    project.usesQrex = true;
    project.targetType = type;
    project.rootDir = m_root;
    project.rootToProjDir = directory;
    project.sourceDir = directory + "/src";
    project.configs.push_back(std::make_unique<ProjectConfig>());
    project.configs.back()->name = "Debug";
    project.configs.back()->platform = "x64";
    return project;
  }

  void AddFileTo(Project& project, const std::string& path, const std::string& text) {
    ASSERT_FALSE(project.filesByPath.count(path)) << path << " is there already: use a new world";
    auto file = std::make_unique<ProjectFile>();
    file->project = &project;
    file->path = path;
    file->name = std::string(FileNameOf(path));
    StemOf(file->name, file->stem);
    file->extension = file->name.substr(std::min(file->stem.size() + 1, file->name.size()));
    file->kind = FileKindOf(file->extension);
    file->isMainSource = file->kind == FileKind::Cpp && file->stem == project.name;
    file->isPublicHeader = file->kind == FileKind::H && IsLibrary(project.targetType) &&
                           path.compare(0, project.sourceDir.size(), project.sourceDir) != 0;
    project.rootFolder.files.push_back(file.get());
    project.filesByPath.emplace(file->path, std::move(file));
    project.filesCollected = false;
    project.folders.clear();
    CreateDirectories(m_root + "/" + path, false);
    ReplaceFile(m_root + "/" + path, text);
  }

  ConfigSettings settings;
  std::unique_ptr<Workspace> workspace;
  std::unique_ptr<TestHost> host;
  std::string trace;  // what was written to the trace log

 private:
  std::string ErrorInNewWorld(const std::string& name, const std::string& text) {
    MakeWorld(app().targetType);
    return ErrorOf(name, "@import \"Vesk/vxObject/IObject.h\" " + text);
  }
  std::string WithShortPaths(std::string text) const {
    ReplaceAllInPlace(text, m_root + "/", "");
    ReplaceAllInPlace(text, "app/src/", "");
    return text;
  }

  static void Cut(std::string& text, const std::string& head, const std::string& foot) {
    ASSERT_EQ(head, text.substr(0, head.size()));
    text.erase(0, head.size());
    ASSERT_TRUE(text.size() >= foot.size() && text.compare(text.size() - foot.size(), foot.size(), foot) == 0) << text;
    text.erase(text.size() - foot.size());
  }

  std::string m_root;
};

}  // namespace qrex
