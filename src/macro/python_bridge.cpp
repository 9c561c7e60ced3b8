#include "macro/python_bridge.h"

namespace qrex {

std::string PythonEvaluate(LSFrame&, const std::string&, const char* position) {
  throw LexScannerException("Python initialisation error: no interpreter is built in", position);
}

}  // namespace qrex
