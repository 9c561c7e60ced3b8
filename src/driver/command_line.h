// What the process is given, and the order of its steps.
#pragma once

#include <string>
#include <vector>

namespace qrex {

// `arguments`: the program's path first. The exit status.
int RunCommandLine(const std::vector<std::string>& arguments);

}  // namespace qrex
