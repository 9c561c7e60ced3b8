// The embedded Python 2.7 interpreter behind @defpython and @runpython. It is loaded and started when one of them first
// needs it and never shut down, so that a run without them needs no Python. All code runs in the dictionary of
// `__main__`: a name that one block sets is known to all later ones, in any file of the run.
//
// The library is the one that the environment variable QREX_PYTHON names, and only that; without it the one found when
// the tool was built, then the system's own.
//
// Failures are LexScannerExceptions at `position`, with Python's traceback in the message.
#pragma once

#include <string>

namespace qrex {

// The value of an expression as text: an int as a 32-bit decimal number, a float, a str, or a list of these.
std::string EvalPython(const std::string& expression, const char* position);
// Runs statements. What they print goes to standard output at once.
void RunPython(const std::string& fileName, const std::string& code, const char* position);

}  // namespace qrex
