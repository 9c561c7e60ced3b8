// compile_commands.json in the folder of the run: what compiles each source of the workspace, in the form that clangd,
// clang-tidy and others read. Each entry has the words as the build would run them, by arguments: without launchers and
// with what response files would hold, and of cl without its precompiled headers, which clang cannot read. Paths stand
// as in these words, from `directory` on.
//
// It follows from the settings and projects alone, so that it is there ahead of the first error, and the same for all
// modes. Left out are assembler sources, and projects that come built or could not be read.
#pragma once

#include <string>

#include "workspace/workspace.h"

namespace qrex {

std::string CompileCommandsOf(const Workspace& workspace, const std::string& directory);
// Writes it where the key asks for it and it differs from what is there. False, with a message, when it fails.
bool WriteCompileCommands(const Workspace& workspace);

}  // namespace qrex
