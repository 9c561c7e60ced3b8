// Reading what tools print: messages are counted, and those about translated files get a line that names the source.
#pragma once

#include <cstdint>
#include <string_view>

#include "builder/build_files.h"

namespace qrex {

struct ToolMessages {
  int64_t errors = 0, warnings = 0;
};

// Echoes the text, on a terminal in colours, and tells the observer of each message. Two forms are recognised:
// `file(line) : error ...` and, of the gcc family, `file:line:column: error: ...`. What a launcher of that name says of
// itself is no message of a tool.
ToolMessages ScanToolOutput(const BuildFiles& builder, std::string_view text, std::string_view launcher = {});

}  // namespace qrex
