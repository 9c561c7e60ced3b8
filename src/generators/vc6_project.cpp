#include "generators/vc6_project.h"

#include "text/exceptions.h"

namespace qrex {

void WriteVc6Project(TextWriter&, Project& project, bool) {
  throw ExceptionBase(project.filePath + "(1) : error : .dsp files are not written yet");
}

void WriteVc6Workspace(TextWriter&, const Workspace& workspace, bool) {
  throw ExceptionBase(workspace.name + "(1) : error : .dsw files are not written yet");
}

}  // namespace qrex
