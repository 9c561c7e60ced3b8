// What a project's build knows of its files: the translator's view of the build. Owns every ScannedFile that is met,
// imported files of other projects included.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <memory_resource>
#include <string>
#include <unordered_map>
#include <vector>

#include "builder/build_paths.h"
#include "text/files.h"
#include "translator/symbols/scanned_file.h"
#include "workspace/workspace.h"

namespace qrex {

// Of an error that ended a translation, or a run.
Message ErrorOf(const IException& exception);

// Where a source defines the target of its project, and with which release; -1: none is known to.
struct DefinedTarget {
  int64_t release = -1;
  std::string path = {};  // in the tree
  SourcePlace place = {};
};

class BuildFiles : public TranslationHost {
  struct Destroy {  // in the memory of all, which goes as one
    void operator()(ScannedFile* file) const { std::destroy_at(file); }
  };

 public:
  BuildFiles(ConfigSettings& settings, Project& project, ProjectConfig& config);
  ~BuildFiles() override;

  // --- TranslationHost
  const ConfigSettings& Settings() const override { return settings; }
  const ProjectConfig& Config() const override { return config; }
  ProjectFile* FindFile(std::string_view path) const override { return project.workspace->FindFile(path); }
  ScannedFile& GetScannedFile(ProjectFile& file) override;
  std::string TranslatedPath(const ScannedFile& file) const override { return paths.Translated(file.file); }
  bool RegisterGuid(const guid& id, const std::string& owner, std::string& existingOwner) override;
  DeclarationRegistry& RegisterMap() override { return registerMap; }
  DeclarationRegistry& UnregisterMap() override { return unregisterMap; }
  SymbolIndex& Symbols() override { return m_symbols; }
  size_t NextFileIndex() override { return m_nextFileIndex++; }
  // A pass behind the first: these files and all that import them are taken back, and are what it gives; what failed
  // begins anew, and the rest is kept.
  std::vector<ScannedFile*> BeginPass(const std::vector<ScannedFile*>& changed);
  size_t FileCount() const { return m_nextFileIndex; }  // above each file's index
  std::vector<const ScannedFile*> FilesOfProject() const override;
  void Tell(const Message& message) override;
  void TellFault(const ScannedFile& file, const IException& exception) override;
  void TakenBack(ScannedFile& file) override;
  void TranslationBegins(const ScannedFile& file) override;
  void TranslationEnds(const ScannedFile& file) override;
  bool KeepsSchemas() const override { return settings.schemas != nullptr; }
  std::string SchemaFault(const ClassDef& def) override;
  void DefinesTarget(const ScannedFile& file, int64_t release, const char* position) override;
  bool FindSourcePlace(const char* position, SourcePlace& place) const override;

  ConfigSettings& settings;
  Project& project;
  ProjectConfig& config;
  const BuildPaths paths;
  DeclarationRegistry registerMap{true};
  DeclarationRegistry unregisterMap{false};
  std::vector<ScannedFile*> scanned;  // of project.files, in their order

 private:
  SymbolIndex m_symbols;  // ahead of the files, whose name spaces refer to it
  std::pmr::monotonic_buffer_resource m_memory;

 public:
  std::pmr::unordered_map<std::string_view, std::unique_ptr<ScannedFile, Destroy>> scannedByPath{&m_memory};
  FileTimes times;
  bool dependencyFileLoaded = false;
  int64_t warningCount = 0, errorCount = 0;
  DefinedTarget target;  // with the key schemaLock, as far as it was translated

 private:
  const ScannedFile* FileOfPosition(const char* position) const;  // whose source text holds it; or null

  std::map<guid, std::string> m_guidOwners;
  size_t m_nextFileIndex = 0;
  mutable const ScannedFile* m_lastPositioned = nullptr;
  mutable std::unordered_map<const ScannedFile*, LineStarts> m_lineStarts;  // of those that messages were about
};

}  // namespace qrex
