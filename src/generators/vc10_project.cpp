#include "generators/vc10_project.h"

#include "text/exceptions.h"

namespace qrex {

void WriteVc10Project(TextWriter&, Project& project, bool) {
  throw ExceptionBase(project.filePath + "(1) : error : .vcxproj files are not written yet");
}

void WriteVc10Filters(TextWriter&, Project& project, bool) {
  throw ExceptionBase(project.filePath + "(1) : error : .vcxproj.filters files are not written yet");
}

}  // namespace qrex
