#include "generators/solution.h"

#include "text/exceptions.h"

namespace qrex {

void WriteSolution(TextWriter&, const Workspace& workspace, bool) {
  throw ExceptionBase(workspace.name + "(1) : error : .sln files are not written yet");
}

}  // namespace qrex
