#include "generators/generate.h"

#include <algorithm>

namespace qrex {

bool AnyProjectUsesQrex(const Workspace& workspace) {
  return std::any_of(workspace.projects.begin(), workspace.projects.end(),
                     [](const auto& project) { return project->usesQrex; });
}

void GenerateProjectFile(Project& project, bool) {
  throw ExceptionBase("Project files are not built yet for " +
                      std::string(CompilerKeyword(project.settings->compiler)));
}

void GenerateWorkspaceFile(Workspace& workspace, bool) {
  throw ExceptionBase("Workspace files are not built yet for " +
                      std::string(CompilerKeyword(workspace.settings.compiler)));
}

}  // namespace qrex
