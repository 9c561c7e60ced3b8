// What the process service asks of the interpreter beyond platform/interpreter.h.
#pragma once

#include <string>

namespace qrex::platform {

constexpr char kInterpreterPath[] = "/bin/sh";

// The batch file that marks a manifest's update is the one that this system has to carry out itself.
bool IsBatchFile(const std::string& line);
int RunBatchFile(const std::string& line);  // its exit code

}  // namespace qrex::platform
