#include "generators/geany.h"

#include "text/exceptions.h"

namespace qrex {

void WriteGeanyProject(TextWriter&, const Workspace& workspace) {
  throw ExceptionBase(workspace.name + "(1) : error : .geany files are not written yet");
}

}  // namespace qrex
