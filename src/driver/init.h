// Lays out a new workspace from the templates that come with the program.
#pragma once

#include <string>

namespace qrex {

// Writes the workspace into the folder, as a whole where that is new, and what was done to standard output; false, with
// a message, when the name will not do, another file is in the way, or a file could not be read or written. What an
// earlier call has left unfinished is finished. By the first word of the command line the templates are found where the
// system does not tell the program's path.
bool InitWorkspace(const std::string& calledAs, const std::string& name, const std::string& folder);

}  // namespace qrex
