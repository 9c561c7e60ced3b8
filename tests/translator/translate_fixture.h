// Translates given texts: a library project of files that live in a folder of the test's own, with a host that keeps
// what the translator tells it.
#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <map>
#include <memory>
#include <string>

#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/trace.h"
#include "translator/qrex_parser.h"
#include "translator/scanned_file.h"
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
  std::string TranslatedPath(const ScannedFile& file) const override { return "translated/" + file.file.path; }
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

// Files of the project `app` stand under app/src/ unless their name holds a slash (then under app/). The project of the
// companion runtime with Vesk/vxObject/IObject.h is there as well.
class TranslateTest : public ::testing::Test, public TraceHook {
 protected:
  TranslateTest() {
    SetTraceHook(this);
    m_root = ::testing::TempDir() + "/" + ::testing::UnitTest::GetInstance()->current_test_info()->name();
    std::filesystem::remove_all(m_root);
    settings.platform = "x64";
    settings.config = "Debug";
    settings.compiler = CompilerKind::gcc;
    workspace = std::make_unique<Workspace>(settings);
    AddProject("app", "app", TargetType::Application);
    AddProject("vxObject", "Vesk/vxObject", TargetType::Application);
    AddFileTo(*workspace->projects[1], "Vesk/vxObject/IObject.h",
              "namespace vesk\n{\n$interface+ IObject\n{\n};\n$interface+ IPersistable : IObject\n{\n};\n}\n");
    host = std::make_unique<TestHost>(*workspace, *app().configs.front());
  }
  ~TranslateTest() override {
    SetTraceHook(nullptr);
    host.reset();
    std::filesystem::remove_all(m_root);
  }

  void OnTrace(std::string_view text) override { trace.append(text); }
  Project& app() { return *workspace->projects.front(); }

  void AddFile(const std::string& name, const std::string& text) {
    AddFileTo(app(), (name.find('/') == std::string::npos ? "app/src/" : "app/") + name, text);
  }

  // The generated text. Throws what the translation throws.
  std::string Translate(const std::string& name) {
    const std::string path = (name.find('/') == std::string::npos ? "app/src/" : "app/") + name;
    app().CollectFiles();
    ScannedFile& file = host->GetScannedFile(*host->FindFile(path));
    LoadText(file.sourceText, file.SourcePath(), true);
    file.translated = true;
    MemoryTextWriter text;
    struct Target : IOutputStream {
      explicit Target(TextWriter& out) : out(out) {}
      void Write(const void* data, size_t n) override { out << std::string_view(static_cast<const char*>(data), n); }
      void Flush() override {}
      TextWriter& out;
    } target(text);
    TranslateFile(file, target);
    return text.TakeText();
  }

  std::string Translate(const std::string& name, const std::string& text) {
    AddFile(name, text);
    return Translate(name);
  }

  // The printed form of the error that the translation of `text` raises.
  std::string ErrorOf(const std::string& name, const std::string& text) {
    try {
      std::string generated = Translate(name, text);
      return "no error, but:\n" + generated;
    } catch (const IException& exception) {
      return ExceptionText(exception);
    }
  }

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
    auto file = std::make_unique<ProjectFile>();
    file->project = &project;
    file->path = path;
    file->name = std::string(FileNameOf(path));
    StemOf(file->name, file->stem);
    file->extension = file->name.substr(file->stem.size() + 1);
    file->kind = FileKindOf(file->extension);
    file->isMainSource = file->kind == FileKind::Cpp && file->stem == project.name;
    file->isPublicHeader = file->kind == FileKind::H && IsLibrary(project.targetType) &&
                           path.compare(0, project.sourceDir.size(), project.sourceDir) != 0;
    project.rootFolder.files.push_back(file.get());
    project.filesByPath[path] = std::move(file);
    CreateDirectories(m_root + "/" + path, false);
    ReplaceFile(m_root + "/" + path, text);
  }

  ConfigSettings settings;
  std::unique_ptr<Workspace> workspace;
  std::unique_ptr<TestHost> host;
  std::string trace;  // what was written to the trace log

 private:
  std::string m_root;
};

}  // namespace qrex
