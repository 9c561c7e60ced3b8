// Which project, workspace and make files a compiler needs, and under which names.
#pragma once

#include "workspace/workspace.h"

namespace qrex {

// With `buildPrefix` the files are those of the translated build, named "build_..."; the gcc family has one form only.
// Files land in the current directory, by WriteIfChanged: a file that cannot be written costs an "Error: " line.
void GenerateProjectFile(Project& project, bool buildPrefix);
void GenerateWorkspaceFile(Workspace& workspace, bool buildPrefix);

}  // namespace qrex
