// Lines for the command interpreter, which have the form of the one that they were written for: "cmd /c REST" runs
// REST; "..." is taken as it stands, and outside of it 1>FILE, 2>FILE and 2>&1 redirect; nothing else has a meaning, so
// that a line runs the one tool that it begins with.
#pragma once

#include <string>
#include <vector>

namespace qrex::platform {

std::string NameHere(const std::string& tool);  // "gcc-4" is "gcc" where there is no other

}  // namespace qrex::platform
