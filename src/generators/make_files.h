// GNU make files: one for each project and configuration, one for each configuration of the workspace, one on top.
#pragma once

#include <string>

#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

// A name that make or its shell would read as more than a name: the file must not be written. Empty: there is none.
std::string NameThatMakeReads(const Project& project, const ProjectConfig& config);
std::string NameThatMakeReads(const Workspace& workspace, const ProjectConfig& config);

void WriteProjectMakeFile(TextWriter& out, const Project& project, const ProjectConfig& config);
void WriteWorkspaceMakeFile(TextWriter& out, const Workspace& workspace, const ProjectConfig& config);
void WriteTopMakeFile(TextWriter& out, const Workspace& workspace);

}  // namespace qrex
