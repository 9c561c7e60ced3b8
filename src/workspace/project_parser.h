// Reads a project file: heads, statements, then the file tree.
#pragma once

#include <functional>
#include <set>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "macro/mpfw_parser.h"
#include "workspace/file_filter.h"
#include "workspace/project_model.h"

namespace qrex {

// Finds, reads, expands and parses the project's file; false after an error, which is reported.
bool LoadProjectFile(Project& project, const std::string& path);

class ProjectParser : public MpfwParser {
 public:
  ProjectParser(Project& project, FileFilter& directoryFilter)
      : MpfwParser(project.context), m_project(project), m_directoryFilter(directoryFilter) {}

  bool ResolveImport(const std::string& path, std::string& found) override;
  std::string ImportHint(const std::string& path) const override;
  void OnImportedFile(MpfwSourceFile& file) override;

  void ParseProject();     // on the processed text
  void ParseStatements();  // until a token that begins none
  bool MayLackBrace() const { return m_blockWithBrace != nullptr; }
  std::string BlockHint() const;

 private:
  using Configs = std::vector<ProjectConfig*>;
  using Files = std::vector<ProjectFile*>;

  void ReadHead(const std::string& name, std::string& out);
  void ParseHeads();
  void SetTargetType(const std::string& text);
  bool ParseStatement();
  void ParseConfig();
  ProjectConfig& AddConfig();
  void ParseSubprojects();
  void ParseToolFiles();
  void ParseBuildEvent(BuildEvent ProjectConfig::*event);
  std::string ReadGeneralKey();
  void ParseGeneral();
  bool ParseOptions(bool add);
  struct Scope {
    Configs configs;                   // those that it selects
    bool isForOtherCompilers = false;  // nor could it select any in this run
  };
  Scope ReadScope();
  bool IsSelected(const ProjectConfig& config, std::string_view spec) const;
  bool NeedsOtherCompiler(std::string_view spec) const;
  std::string ReadRawBlock();
  void ReadBlockOf(const Scope& scope, const std::function<void()>& read);
  void AppendRawBlock(const Configs& configs, std::string ProjectConfig::*text);
  std::string ForConfig(std::string text, const ProjectConfig& config) const;  // $(PLATFORM), $(CONFIG)
  void SubstituteInOptions(OptionMap& options, const ProjectConfig& config) const;
  void RequireBrace();
  bool KeepsRawText() const;  // compilers whose switches stay text

  // --- File tree (project_files.cpp)
  void ParseTree(ProjectFolder& folder, const std::string& directory);
  void ParseEntry(ProjectFolder& folder, const std::string& directory);
  void ParseName(ProjectFolder& folder, const std::string& directory);
  void ParseNestedBlock(ProjectFolder& folder, const std::string& directory, const std::string& name,
                        const std::string* displayName);
  bool IsFilterNext() const;
  FileFilter ReadFilter();
  void ReadPatterns(FileFilter& filter);
  void ParseDirectories();
  void ParseSearch(ProjectFolder& folder, const std::string& directory);
  struct Search {
    FileFilter filter;
    bool recurse = false;
    bool flat = false;
    std::set<ProjectFile*> matched;  // two roots may hold one file
    std::set<std::string> searched;  // the directories, relative to the roots
    std::vector<std::string> open;   // the directories under search, outermost first, without links
  };
  void Find(Search& search, ProjectFolder& folder, const std::string& directory);
  void FindUnder(const std::string& root, Search& search, ProjectFolder& folder, const std::string& directory);
  [[noreturn]] void FailSearch(const std::string& folder, uint32_t code) const;
  void FindInSubdirectory(Search& search, ProjectFolder& folder, const std::string& directory, const std::string& name);
  void RequireInTree(const std::string& path, const char* position) const;
  ProjectFile& AddFile(ProjectFolder& folder, const std::string& path, const std::string& displayName);
  ProjectFolder& FolderNamed(ProjectFolder& parent, const std::string& name, bool* isNew = nullptr);
  void ParseFileOptions(const Files& files);
  void ParseFileOption(const Files& files);
  void ParseExclude(const Files& files);
  void ReadSwitchesOf(const Files& files, const Configs& configs, bool add);

  Project& m_project;
  FileFilter& m_directoryFilter;
  const char* m_block = nullptr;           // of switches, the last one
  const char* m_blockWithBrace = nullptr;  // in its raw text
  size_t m_depth = 0;
  const char* m_entry = nullptr;                                // of the file tree, which is being read
  std::unordered_map<std::string, ProjectFile*> m_foldedPaths;  // where names fold case
};

}  // namespace qrex
