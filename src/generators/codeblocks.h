// The .cbp project and the .workspace of Code::Blocks.
#pragma once

#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

void WriteCodeBlocksProject(TextWriter& out, const Project& project);
void WriteCodeBlocksWorkspace(TextWriter& out, const Workspace& workspace);

}  // namespace qrex
