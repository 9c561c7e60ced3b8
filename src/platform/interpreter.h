// Lines for the command interpreter, which have the form of the one that they were written for: "cmd /c REST" runs
// REST; "..." is taken as it stands, and outside of it 1>FILE, 2>FILE and 2>&1 redirect; nothing else has a meaning, so
// that a line runs the one tool that it begins with.
#pragma once

#include <string>
#include <vector>

namespace qrex::platform {

std::string ForInterpreter(const std::string& line);  // the line as the interpreter of this system reads it
// The line as a program on PATH and its arguments, if it asks nothing of the interpreter but that: none otherwise, and
// where that has to say that there is no such program. To start one costs more than most tools take to say no.
std::vector<std::string> WordsWithoutInterpreter(const std::string& line);
std::string NameHere(const std::string& tool);  // "gcc-4" is "gcc" where there is no other

}  // namespace qrex::platform
