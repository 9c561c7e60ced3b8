// What the process service asks of the interpreter beyond platform/interpreter.h.
#pragma once

#include <string>
#include <vector>

namespace qrex::platform {

constexpr char kInterpreterPath[] = "/bin/sh";
std::string ForInterpreter(const std::string& line);  // the line as the interpreter of this system reads it
// The line as a program on PATH and its arguments, if it asks nothing of the interpreter but that: none otherwise, and
// where that has to say that there is no such program. To start one costs more than most tools take to say no.
std::vector<std::string> WordsWithoutInterpreter(const std::string& line);

// The batch file that marks a manifest's update is the one that this system has to carry out itself.
bool IsBatchFile(const std::string& line);
int RunBatchFile(const std::string& line);  // its exit code

}  // namespace qrex::platform
