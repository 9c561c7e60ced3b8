// The project model: what a project file says, as the builder and all generators read it.
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <memory_resource>
#include <string>
#include <unordered_map>
#include <vector>

#include "macro/mpfw_parser.h"
#include "text/guid.h"
#include "workspace/config_settings.h"

namespace qrex {

struct Project;
struct ProjectConfig;
struct ProjectFile;
class Workspace;

// Property name to value text, in byte order of the names; lists are joined with `;` (workspace/switch_tables.h).
using OptionMap = std::map<std::string, std::string>;

enum class TargetType { Application, StaticLibrary, ConsoleApplication, DynamicLinkLibrary, UtilityProject };
std::string_view TargetTypeName(TargetType type);       // "Application", "Static Library", ...
std::string_view TargetTypeExtension(TargetType type);  // "exe", "lib", "exe", "dll", "???"
inline bool IsLibrary(TargetType type) {
  return type == TargetType::StaticLibrary || type == TargetType::DynamicLinkLibrary;
}

enum class FileKind { Other, C, Cpp, H, Rc, Asm, Def, Qrpj, Py };
FileKind FileKindOf(std::string_view lowerCaseExtension);

struct BuildEvent {
  bool present = false;
  std::string description;
  std::string commandLine;
};

struct ProjectConfig {
  std::string platform;
  std::string name;
  std::vector<std::string> tags;
  BuildEvent preBuildEvent, preLinkEvent, postBuildEvent;
  std::map<std::string, std::string> generalOptions;
  std::string platformToolset;  // empty: that of the settings
  OptionMap compilerOptions;
  OptionMap resourceOptions;
  std::string compilerText;  // raw switches of +cpp for vc6 and the gcc family
  std::string linkerText;    // raw switches of +link and -link
  OptionMap linkerOptions;   // made from linkerText when a generator needs it
};

struct FileConfigRecord {
  ProjectConfig* config = nullptr;
  OptionMap options;
  std::string addText;  // raw text for vc6 and the gcc family
  std::string removeText;
  bool excluded = false;  // for this configuration
};

struct ProjectFile {
  Project* project = nullptr;
  bool isMainSource = false;    // kind cpp, and the stem is the project's name
  bool isPublicHeader = false;  // kind h of a library, outside its source directory
  FileKind kind = FileKind::Other;
  std::string name;       // display name
  std::string stem;       // of `name`
  std::string extension;  // of `name`, lower case
  std::string path;       // relative to the tree root: the key of the file everywhere
  std::vector<std::unique_ptr<FileConfigRecord>> configRecords;
  ProjectFile* pairedHeader = nullptr;
  ProjectFile* pairedSource = nullptr;
  bool excluded = false;           // from all configurations
  const char* listedAt = nullptr;  // the entry, in the expansion of a project file

  FileConfigRecord* FindRecord(const ProjectConfig& config) const;  // or null
  FileConfigRecord& RecordOf(ProjectConfig& config);                // created on first need
};

struct ProjectFolder {
  Project* project = nullptr;
  std::string name;
  std::vector<std::unique_ptr<ProjectFolder>> subfolders;
  std::vector<ProjectFile*> files;
};

struct Project {
  explicit Project(Workspace& workspace);

  void Empty();                                 // what the file said, but for name and place
  void CollectFiles();                          // fills folders, files, filesByName and the header/source pairs, once
  bool AddSubproject(const std::string& path);  // false, with a warning line, when it was there already
  const std::string& MangledProjDir();          // rootToProjDir with `/` as `_`
  ProjectConfig* FindConfig(const std::string& name, const std::string& platform) const;  // or null
  ProjectConfig* ConfigOfRun() const;                                                     // null, with an error told
  std::string SourcePath(const ProjectFile& file) const;   // rootDir joined with the file's path
  std::string ListingHint(const ProjectFile& file) const;  // for a file that is missing: where it is listed

  Workspace* workspace;
  ConfigSettings* settings;
  MpfwContext context;  // its frame starts as a copy of the workspace's
  bool libraryIsStatic = false;
  bool usesQrex = false;
  bool exported = false;
  bool hasFaultyFile = false;  // it was found, but can't be read: nothing is done for the project
  TargetType targetType = TargetType::Application;
  std::string rootDir;
  std::string filePath;
  std::string rootToProjDir;
  std::string projDirToRoot;
  std::string sourceDir;
  qrex::guid guid;
  std::string name;
  ProjectFolder rootFolder;
  std::vector<std::unique_ptr<ProjectConfig>> configs;
  std::vector<std::string> subprojects;  // project paths relative to the tree
  std::vector<std::string> toolFiles;
  bool filesCollected = false;
  std::vector<ProjectFolder*> folders;             // subfolders first, the root last
  std::vector<ProjectFile*> files;                 // in build order
  std::pmr::monotonic_buffer_resource nodeMemory;  // of the two maps, which only grow
  std::pmr::unordered_map<std::string_view, ProjectFile*> filesByName{&nodeMemory};
  std::pmr::map<std::string_view, std::unique_ptr<ProjectFile>> filesByPath{&nodeMemory};  // the path is the file's own
  std::string mangledProjDir;
};

}  // namespace qrex
