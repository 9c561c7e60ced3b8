#include "driver/depfile.h"

#include <algorithm>
#include <unordered_set>

#include "builder/build_paths.h"
#include "builder/project_builder.h"
#include "platform/file_system.h"
#include "text/exceptions.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/trace.h"

namespace qrex {

namespace {

// Takes each path once.
class PathList {
 public:
  void Add(std::string path) {
    if (m_known.insert(path).second) m_paths.push_back(std::move(path));
  }
  std::vector<std::string> Take() { return std::move(m_paths); }

 private:
  std::unordered_set<std::string> m_known;
  std::vector<std::string> m_paths;
};

void AddTools(const Project& project, const ProjectConfig& config, PathList& outputs) {
  const BuildPaths paths(project, config);
  for (const ProjectFile* file : project.files) {
    if (HasObject(*file)) outputs.Add(paths.Object(*file));
  }
  if (project.targetType != TargetType::UtilityProject) outputs.Add(paths.Target());
}

}  // namespace

std::vector<std::string> InputsOf(const Workspace& workspace) {
  PathList inputs;
  for (const auto& file : workspace.settings.sourceFiles) inputs.Add(file->path);
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

// Backslashes in front of what is escaped are doubled; elsewhere they stand for themselves.
std::string DepfileName(std::string_view path) {
  std::string name;
  size_t backslashes = 0;
  for (const char c : path) {
    if (c == ' ' || c == '\t') name.append(backslashes + 1, '\\');
    if (c == '#' || c == ':' || c == ';') name += '\\';
    if (c == '$') name += '$';
    name += c;
    backslashes = c == '\\' ? backslashes + 1 : 0;
  }
  return name;
}

namespace {

// To make alone `%` is something else in a target; ninja does not ask for the names of targets.
std::string TargetName(const std::string& path) {
  std::string name = DepfileName(path);
  ReplaceAllInPlace(name, "%", "\\%");
  return name;
}

}  // namespace

bool WriteDepfile(const Workspace& workspace, const std::vector<std::string>& generated) {
  const ConfigSettings& settings = workspace.settings;
  const std::string& path = settings.depfile;
  const bool isGen = settings.mode == RunMode::Gen;
  if (path.empty() || (!isGen && settings.mode != RunMode::Build)) return true;
  PathList targets;
  targets.Add(path);
  if (isGen) targets.Add(workspace.name + ".projects");
  for (const std::string& output : isGen ? generated : OutputsOf(workspace)) targets.Add(output);
  std::string text, emptyRules;
  for (const std::string& target : targets.Take()) text.append(text.empty() ? "" : " ").append(TargetName(target));
  text += ":";
  std::vector<std::string> inputs = InputsOf(workspace);
  for (std::string& folder : ListedFolders(settings)) inputs.push_back(std::move(folder));
  for (const std::string& input : inputs) {
    const std::string name = DepfileName(input);
    text.append(" \\\n  ").append(name);
    const bool isPlainRule = input.find_first_of("%=") == std::string::npos;  // no pattern, no assignment
    if (isPlainRule) emptyRules.append(name).append(":\n");
  }
  try {
    CreateDirectories(path, false);
    settings.leftovers.Beside(path);
    ReplaceFile(path, text + "\n" + emptyRules);
  } catch (const IException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
    return false;
  }
  platform::SetWriteTime(path, settings.begun);
  return true;
}

}  // namespace qrex
