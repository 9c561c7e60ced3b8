// Lays out a new workspace from the templates that come with the program.
#pragma once

#include <string>

namespace qrex {

// Writes the workspace into the folder, and what was done to standard output; false, with a message and nothing
// written, when the name will not do, a file is there already, or the templates are not found. Raises FileException.
bool InitWorkspace(const std::string& name, const std::string& folder);

}  // namespace qrex
