// The .geany project of Geany: one for a workspace.
#pragma once

#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

void WriteGeanyProject(TextWriter& out, const Workspace& workspace);

}  // namespace qrex
