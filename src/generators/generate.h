// Which project, workspace and make files a compiler needs, and under which names.
#pragma once

#include "workspace/workspace.h"

namespace qrex {

// With `buildPrefix` the files are those of the translated build, named "build_...".
void GenerateProjectFile(Project& project, bool buildPrefix);
void GenerateWorkspaceFile(Workspace& workspace, bool buildPrefix);
bool AnyProjectUsesQrex(const Workspace& workspace);

}  // namespace qrex
