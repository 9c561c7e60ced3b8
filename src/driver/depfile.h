// What a run reads and what comes of it, for the tools that call it: as a dependency file in the syntax of make.
//
//   app.d qrexsource/x64/Debug/app/src/app.cpp: app.qrex tree/app/src/app.cpp
//   app.qrex:
//   tree/app/src/app.cpp:
//
// with a line for each file behind the colon. It is one rule, since what is stale is the tool's own business: whoever
// calls it need only know whether to. The file is the first of its targets, and bears the time at which the run began:
// so a make file that includes it has it made by a rule for it, and what changes during the run makes it stale. The
// empty rules let make go on when a file is gone. Names are escaped as compilers do, whose files make and ninja read.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "workspace/workspace.h"

namespace qrex {

std::string DepfileName(std::string_view path);
// Writes what the key names, if anything; `generated`: the files of mode = gen. False, with a message, when it fails.
bool WriteDepfile(const Workspace& workspace, const std::vector<std::string>& generated);

}  // namespace qrex
