// What `Qrex --list` tells scripts and other build tools: words and paths with a tabulator between them, a line for
// each thing. Paths are as the run has them: those of translations begin in its folder.
//
//   input PATH               a file of settings that was read; a change of it may change the list
//   folder PATH              its entries decide what is listed
//   project NAME KIND        translated, built (of it the headers alone are translated) or plain; of it are:
//   config NAME PLATFORM     one of its configurations
//   include PATH             where what is translated looks for headers, in the configuration of the run
//   compiled SOURCE OUTPUT   a file with its translation, which a compiler is given
//   file SOURCE OUTPUT       any other one
//
// The last three are missing where the project has no such configuration or nothing of it is translated.
#pragma once

#include <string>

#include "workspace/workspace.h"

namespace qrex {

bool IsWholeWorkspace(const Workspace& workspace);  // each project was found and could be read
std::string ListingOf(const Workspace& workspace);

}  // namespace qrex
