// The .sln solution of Visual Studio 2005 and later.
#pragma once

#include "generators/form.h"
#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

void WriteSolution(TextWriter& out, const Workspace& workspace, Form form);

}  // namespace qrex
