// GNU make files: one for each project and configuration, one for each configuration of the workspace, one on top.
#pragma once

#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

void WriteProjectMakeFile(TextWriter& out, const Project& project, const ProjectConfig& config);
void WriteWorkspaceMakeFile(TextWriter& out, const Workspace& workspace, const ProjectConfig& config);
void WriteTopMakeFile(TextWriter& out, const Workspace& workspace);

}  // namespace qrex
