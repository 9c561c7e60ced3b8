#include "generators/vc8_project.h"

#include "text/exceptions.h"

namespace qrex {

void WriteVc8Project(TextWriter&, Project& project, bool) {
  throw ExceptionBase(project.filePath + "(1) : error : .vcproj files are not written yet");
}

}  // namespace qrex
