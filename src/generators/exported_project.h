// The description of a project for users of the exported package.
#pragma once

#include "workspace/project_model.h"

namespace qrex {

void WriteExportedProject(Project& project);

}  // namespace qrex
