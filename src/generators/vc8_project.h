// The .vcproj project of Visual Studio 2005 and 2008.
#pragma once

#include "generators/form.h"
#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

void WriteVc8Project(TextWriter& out, Project& project, Form form);

}  // namespace qrex
