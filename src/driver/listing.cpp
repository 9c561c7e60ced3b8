#include "driver/listing.h"

#include <algorithm>
#include <initializer_list>
#include <string_view>

#include "builder/build_paths.h"
#include "builder/run_files.h"

namespace qrex {

namespace {

void AddLine(std::string& list, std::initializer_list<std::string_view> words) {
  for (const std::string_view word : words) list.append(word).append("\t");
  list.back() = '\n';
}

void AddTranslation(std::string& list, Project& project, const ProjectConfig& config) {
  for (const std::string& path : IncludePaths(project, config, true)) AddLine(list, {"include", path});
  project.CollectFiles();
  const BuildPaths paths(project, config);
  for (const ProjectFile* file : project.files) {
    if (!IsTranslated(*file)) continue;
    const bool isCompiled = HasObject(*file) && !project.exported;
    AddLine(list, {isCompiled ? "compiled" : "file", project.SourcePath(*file), paths.Translated(*file)});
  }
}

}  // namespace

bool IsWholeWorkspace(const Workspace& workspace) {
  return std::none_of(workspace.projects.begin(), workspace.projects.end(),
                      [](const auto& project) { return project->hasFaultyFile || project->name.empty(); });
}

std::string ListingOf(const Workspace& workspace) {
  const ConfigSettings& settings = workspace.settings;
  std::string list;
  for (const auto& file : settings.sourceFiles) AddLine(list, {"input", file->path});
  for (const std::string& folder : ListedFolders(settings)) AddLine(list, {"folder", folder});
  for (const auto& project : workspace.projects) {
    const bool isTranslated = IsTranslated(*project);
    AddLine(list, {"project", project->name, !isTranslated ? "plain" : project->exported ? "built" : "translated"});
    for (const auto& config : project->configs) AddLine(list, {"config", config->name, config->platform});
    const ProjectConfig* config = project->FindConfig(settings.config, settings.platform);
    if (isTranslated && config) AddTranslation(list, *project, *config);
  }
  return list;
}

}  // namespace qrex
