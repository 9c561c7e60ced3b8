// Hints on a whole run: what is no fault, and yet seldom what was meant.
#pragma once

#include "workspace/workspace.h"

namespace qrex {

// A project that lists files with the extensions of C++ elsewhere: on a terminal, and with `diagnostics` anywhere.
void TellCopiedSources(const Project& project);
// Make files from whose call of this program no build comes.
void HintAtCallOfMake(const Workspace& workspace);

}  // namespace qrex
