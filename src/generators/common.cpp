#include "generators/common.h"

#include <algorithm>

#include "text/paths.h"

namespace qrex {

bool AnyProjectUsesQrex(const Workspace& workspace) {
  return std::any_of(workspace.projects.begin(), workspace.projects.end(),
                     [](const auto& project) { return project->usesQrex; });
}

std::string SubprojectName(std::string_view path) {
  std::string name;
  StemOf(path, name);
  return name;
}

const Project* FindDependency(const Project& project, const std::string& path) {
  const Project* dependency = project.workspace->FindSubproject(path);
  if (!dependency) {
    TraceWriter() << "Error : Can't find dependent project " << SubprojectName(path) << " under project "
                  << project.name << "\n";
  }
  return dependency;
}

bool HoldsProjectFile(const Project& project, const ProjectFolder& parent, const ProjectFolder& folder, Form form) {
  return form == Form::Plain && &parent == &project.rootFolder && folder.name == "src";
}

std::string ProjectFileEntry(const Project& project, std::string_view base) {
  return PathJoin(base, project.sourceDir) + "/" + project.name + ".qrpj";
}

}  // namespace qrex
