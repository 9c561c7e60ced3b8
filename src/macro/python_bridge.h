// The embedded Python interpreter behind @defpython and @runpython. It starts at first need.
#pragma once

#include <string>

#include "macro/frame.h"

namespace qrex {

// Evaluates the text as a Python expression; the result as text. Throws LexScannerException.
std::string PythonEvaluate(LSFrame& frame, const std::string& expression, const char* position);
// Runs the text as Python statements; the text that they emit. Throws LexScannerException.
std::string PythonRun(LSFrame& frame, const std::string& statements, const char* position);

}  // namespace qrex
