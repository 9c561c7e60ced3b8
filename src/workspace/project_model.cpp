#include "workspace/project_model.h"

#include <algorithm>
#include <unordered_map>

#include "text/files.h"
#include "text/paths.h"
#include "workspace/switch_blocks.h"
#include "workspace/workspace.h"

namespace qrex {

std::string_view TargetTypeName(TargetType type) {
  static constexpr std::string_view kNames[] = {"Application", "Static Library", "Console Application",
                                                "Dynamic-Link Library", "Utility Project"};
  return kNames[static_cast<size_t>(type)];
}

std::string_view TargetTypeExtension(TargetType type) {
  static constexpr std::string_view kExtensions[] = {"exe", "lib", "exe", "dll", "???"};
  return kExtensions[static_cast<size_t>(type)];
}

FileKind FileKindOf(std::string_view extension) {
  static constexpr std::string_view kExtensions[] = {"", "c", "cpp", "h", "rc", "asm", "def", "qrpj", "py"};
  for (size_t i = 1; i < std::size(kExtensions); ++i) {
    if (extension == kExtensions[i]) return static_cast<FileKind>(i);
  }
  return FileKind::Other;
}

FileConfigRecord* ProjectFile::FindRecord(const ProjectConfig& config) const {
  for (const auto& record : configRecords) {
    if (record->config == &config) return record.get();
  }
  return nullptr;
}

FileConfigRecord& ProjectFile::RecordOf(ProjectConfig& config) {
  if (FileConfigRecord* record = FindRecord(config)) return *record;
  configRecords.push_back(std::make_unique<FileConfigRecord>());
  configRecords.back()->config = &config;
  return *configRecords.back();
}

Project::Project(Workspace& workspace)
    : workspace(&workspace), settings(&workspace.settings), context(workspace.context), guid(MakeGuid()) {
  rootFolder.project = this;
}

void Project::Empty() {
  usesQrex = exported = libraryIsStatic = false;
  targetType = TargetType::Application;
  subprojects.clear();
  toolFiles.clear();
  rootFolder.subfolders.clear();
  rootFolder.files.clear();
  filesByPath.clear();
  configs.clear();
}

bool Project::AddSubproject(const std::string& path) {
  for (const std::string& known : subprojects) {
    if (!EqualIgnoringCase(known, path)) continue;
    TraceWriter() << "*** Warning: project " << name << " already has subproject " << path << "\n";
    return false;
  }
  subprojects.push_back(path);
  return true;
}

const std::string& Project::MangledProjDir() {
  if (mangledProjDir.empty()) {
    mangledProjDir = rootToProjDir;
    std::replace(mangledProjDir.begin(), mangledProjDir.end(), '/', '_');
  }
  return mangledProjDir;
}

ProjectConfig* Project::FindConfig(const std::string& configName, const std::string& platform) const {
  for (const auto& config : configs) {
    if (config->name == configName && config->platform == platform) return config.get();
  }
  return nullptr;
}

namespace {

std::string KnownConfigs(const Project& project) {
  if (project.configs.empty()) return project.filePath + " has no config { ... }";
  std::string text = project.filePath + " has";
  for (const auto& config : project.configs) text += " " + config->name + "|" + config->platform;
  return text;
}

}  // namespace

ProjectConfig* Project::ConfigOfRun() const {
  ProjectConfig* const config = FindConfig(settings->config, settings->platform);
  if (!config) {
    const std::string wanted = settings->config + "|" + settings->platform;
    settings->Tell(Message(Severity::Error, "Error: ", "There is no configuration " + wanted + " in project " + name)
                       .WithHint(KnownConfigs(*this)));
  }
  return config;
}

std::string Project::SourcePath(const ProjectFile& file) const { return PathJoin(rootDir, file.path); }

std::string Project::ListingHint(const ProjectFile& file) const {
  std::string path;
  int64_t line;
  if (!FindExpandedLine(settings->sourceFiles, file.listedAt, path, line)) return {};
  std::string listed = file.path + " is listed in " + path + "(" + std::to_string(line) + ")";
  for (const std::string& root : settings->virtualTree) {
    if (root == rootDir || !FileExists(PathJoin(root, file.path))) continue;
    return listed + "; it is in " + root + ", but files of a project are read below its own root, " + rootDir;
  }
  if (filePath.starts_with(PathJoin(rootDir, rootToProjDir) + "/")) return listed;
  return listed + ", and " + filePath + " does not stand below its $ROOT_TO_PROJDIR, \"" + rootToProjDir + "\"";
}

namespace {

void AddFoldersOf(ProjectFolder& folder, std::vector<ProjectFolder*>& folders) {
  for (const auto& subfolder : folder.subfolders) AddFoldersOf(*subfolder, folders);
  folders.push_back(&folder);
}

}  // namespace

void Project::CollectFiles() {
  if (filesCollected) return;
  filesCollected = true;
  filesByName.clear();
  AddFoldersOf(rootFolder, folders);

  std::pmr::monotonic_buffer_resource memory;
  std::pmr::unordered_map<std::string_view, ProjectFile*> sourcesByStem(&memory);
  sourcesByStem.reserve(filesByPath.size());
  filesByName.reserve(filesByPath.size());
  std::vector<ProjectFile*> creators, sources, assembler;  // creators: the last one met comes first
  ProjectFile* main = nullptr;
  files.clear();
  for (const ProjectFolder* folder : folders) {
    for (ProjectFile* file : folder->files) {
      if (file->excluded) continue;
      if (file->kind == FileKind::Cpp) {
        if (file->isMainSource) {
          main = file;
        } else {
          (CreatesPrecompiledHeader(*file) ? creators : sources).push_back(file);
        }
        sourcesByStem[file->stem] = file;
      } else if (file->kind == FileKind::Asm) {
        assembler.push_back(file);
      } else {
        files.push_back(file);
      }
      ProjectFile*& named = filesByName[file->name];
      if (named) {
        TraceWriter() << "Warning : Project " << rootToProjDir << " has repeated filename " << file->name << "\n";
      }
      named = file;
    }
  }
  files.insert(files.end(), creators.rbegin(), creators.rend());
  files.insert(files.end(), sources.begin(), sources.end());
  if (main) files.push_back(main);
  files.insert(files.end(), assembler.begin(), assembler.end());

  for (ProjectFile* file : files) {
    if (file->kind != FileKind::H) continue;
    auto source = sourcesByStem.find(file->stem);
    if (source == sourcesByStem.end()) continue;
    file->pairedSource = source->second;
    source->second->pairedHeader = file;
  }
}

}  // namespace qrex
