#include "generators/codeblocks.h"

#include "text/exceptions.h"

namespace qrex {

void WriteCodeBlocksProject(TextWriter&, const Project& project) {
  throw ExceptionBase(project.filePath + "(1) : error : .cbp files are not written yet");
}

void WriteCodeBlocksWorkspace(TextWriter&, const Workspace& workspace) {
  throw ExceptionBase(workspace.name + "(1) : error : .workspace files are not written yet");
}

}  // namespace qrex
