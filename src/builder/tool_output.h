// Reading what tools print: messages are counted, and those about translated files get a line that names the source.
#pragma once

#include <string_view>

#include "builder/project_builder.h"

namespace qrex {

// Echoes the text. Two forms are recognised: `file(line) : error ...` and, of the gcc family, `file:line:column: error:
// ...`. False if any line is an error.
bool ScanToolOutput(ProjectBuilder& builder, std::string_view text);

}  // namespace qrex
