#include "builder/run_files.h"

#include <utility>

#include "builder/build_paths.h"
#include "builder/project_builder.h"
#include "text/files.h"
#include "text/paths.h"

namespace qrex {

namespace {

void AddTools(const Project& project, const ProjectConfig& config, PathList& outputs) {
  const BuildPaths paths(project, config);
  for (const ProjectFile* file : project.files) {
    if (HasObject(*file)) outputs.Add(paths.Object(*file));
  }
  if (project.targetType != TargetType::UtilityProject) outputs.Add(paths.Target());
}

}  // namespace

std::vector<std::string> SettingFiles(const ConfigSettings& settings) {
  PathList files;
  for (const auto& file : settings.sourceFiles) files.Add(file->path);
  return files.Take();
}

std::vector<std::string> InputsOf(const Workspace& workspace) {
  PathList inputs;
  for (std::string& path : SettingFiles(workspace.settings)) inputs.Add(std::move(path));
  if (workspace.settings.mode == RunMode::Gen) return inputs.Take();
  for (const auto& project : workspace.projects) {
    if (!IsTranslated(*project)) continue;
    project->CollectFiles();
    for (const ProjectFile* file : project->files) {
      if (IsTranslated(*file)) inputs.Add(project->SourcePath(*file));
    }
  }
  return inputs.Take();
}

std::vector<std::string> ListedFolders(const ConfigSettings& settings) {
  std::string own, path;
  RealPathOf(".", own);
  std::vector<std::string> folders;
  for (const std::string& folder : settings.listedFolders) {
    if (RealPathOf(folder, path) && path != own) folders.push_back(folder);
  }
  return folders;
}

std::vector<std::string> OutputsOf(const Workspace& workspace) {
  const ConfigSettings& settings = workspace.settings;
  PathList outputs;
  for (const auto& project : workspace.projects) {
    const ProjectConfig* config = project->FindConfig(settings.config, settings.platform);
    if (!IsTranslated(*project) || !config) continue;
    project->CollectFiles();
    const BuildPaths paths(*project, *config);
    for (const ProjectFile* file : project->files) {
      if (IsTranslated(*file)) outputs.Add(paths.Translated(*file));
    }
    if (project->exported) continue;
    if (!settings.translateOnly) AddTools(*project, *config, outputs);
    if (!settings.exportPublicHeaders) continue;
    for (const ProjectFile* file : PublicFiles(*project)) {
      outputs.Add(settings.exportTranslatedInclude + "/" + file->path);
      outputs.Add(settings.exportUntranslatedInclude + "/" + file->path);
    }
  }
  return outputs.Take();
}

}  // namespace qrex
