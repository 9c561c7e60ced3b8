// The .dsp project and the .dsw workspace of Visual C++ 6.
#pragma once

#include "generators/form.h"
#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

void WriteVc6Project(TextWriter& out, Project& project, Form form);
void WriteVc6Workspace(TextWriter& out, const Workspace& workspace, Form form);

}  // namespace qrex
