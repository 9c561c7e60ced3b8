// The .vcxproj project of Visual Studio 2010 and later, and its .vcxproj.filters.
#pragma once

#include "generators/form.h"
#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

void WriteVc10Project(TextWriter& out, Project& project, Form form);
void WriteVc10Filters(TextWriter& out, Project& project, Form form);

}  // namespace qrex
