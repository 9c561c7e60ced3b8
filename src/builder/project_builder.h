// One project in one configuration, from its file list to its target. Owns every ScannedFile that it meets, imported
// files of other projects included.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "text/files.h"
#include "translator/symbols/scanned_file.h"
#include "workspace/workspace.h"

namespace qrex {

class ProjectBuilder : public TranslationHost {
 public:
  ProjectBuilder(ConfigSettings& settings, Project& project, ProjectConfig& config);
  ~ProjectBuilder() override;

  // With a single file only that file is compiled, and resources and the link are left out. False when a step failed.
  // An exception of the translation goes on to the caller; what was finished before it is kept.
  bool Build(const std::string& dependencyFile, const ProjectFile* singleFile);
  void Clean(const std::string& dependencyFile);  // what could not be deleted counts as errors

  // --- TranslationHost
  const ConfigSettings& Settings() const override { return settings; }
  const ProjectConfig& Config() const override { return config; }
  ProjectFile* FindFile(const std::string& path) const override { return project.workspace->FindFile(path); }
  ScannedFile& GetScannedFile(ProjectFile& file) override;
  std::string TranslatedPath(const ScannedFile& file) const override { return TranslatedPath(file.file); }
  bool RegisterGuid(const guid& id, const std::string& owner, std::string& existingOwner) override;
  DeclarationRegistry& RegisterMap() override { return registerMap; }
  DeclarationRegistry& UnregisterMap() override { return unregisterMap; }
  SymbolIndex& Symbols() override { return m_symbols; }
  size_t NextFileIndex() override { return m_nextFileIndex++; }
  size_t FileCount() const { return m_nextFileIndex; }  // above each file's index
  std::vector<const ScannedFile*> FilesOfProject() const override;
  void CountWarning() override { ++warningCount; }
  bool FindSourcePosition(const char* position, std::string& path, int64_t& line) const override;

  // --- Paths
  std::string TranslatedPath(const ProjectFile& file) const;
  const std::string& IntermediateDirectory() const { return m_intermediateDirectory; }
  std::string LibraryDirectory() const;

  ConfigSettings& settings;
  Project& project;
  ProjectConfig& config;
  DeclarationRegistry registerMap{true};
  DeclarationRegistry unregisterMap{false};
  std::vector<ScannedFile*> scanned;  // of project.files, in their order

 private:
  SymbolIndex m_symbols;  // ahead of the files, whose name spaces refer to it

 public:
  std::unordered_map<std::string_view, std::unique_ptr<ScannedFile>> scannedByPath;
  FileTimes times;
  bool dependencyFileLoaded = false;
  bool hasStaleFiles = false;  // as judged from the dependency file and the times
  int64_t errorCount = 0;
  int64_t warningCount = 0;

 private:
  void WriteHeading(std::string_view end) const;
  void PrepareFiles(const std::string& dependencyFile);
  void ReadTimes();
  bool RunsTools() const { return !project.exported && !settings.translateOnly; }
  bool ProcessFiles(const ProjectFile* singleFile);
  bool ProcessFile(ScannedFile& file, const ProjectFile* singleFile);
  void LearnNames(ScannedFile& file);
  bool CompileResourceIfStale(ScannedFile& file);
  bool CompileIfStale(ScannedFile& file);
  void ReportUnregistered() const;
  bool LinkIfStale();
  const ScannedFile* FileOfPosition(const char* position) const;  // whose source text holds it; or null
  void Save(const std::string& dependencyFile);

  const std::string m_translationDirectory, m_intermediateDirectory;
  std::map<guid, std::string> m_guidOwners;
  std::unordered_map<std::string, int64_t> m_objectTimes;  // as the compile steps know them
  size_t m_nextFileIndex = 0;
  mutable const ScannedFile* m_lastPositioned = nullptr;
  mutable std::unordered_map<const ScannedFile*, LineStarts> m_lineStarts;  // of those that messages were about
};

// Copies what is outside the project's `src` folder to the export directories, translated and as it is.
void ExportPublicHeaders(Project& project, ProjectConfig& config);

// qrexsource/PLATFORM/CONFIG, and the dependency file of a project there.
std::string TranslationDirectory(const ProjectConfig& config);
std::string DependencyFilePath(const Project& project, const ProjectConfig& config);

}  // namespace qrex
