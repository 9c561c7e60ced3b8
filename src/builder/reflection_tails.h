// Which .cpp holds the reflection tail of which header. A tail is in the output of the first .cpp, in the order of
// the build, that imports the header directly (or of the header's own .cpp alone). So an edit of one .cpp can move a
// tail into or out of the output of another that is not stale, and that must be written again too: else two outputs
// hold the tail, or none.
//
// Where the tails are needs no record of its own: it follows from the imports in the dependency file, as long as the
// outputs agree with these. Whatever does not agree when they are saved is stale in the next run.
#pragma once

#include "builder/build_files.h"

namespace qrex {

// Sets the `tailHolder` of each file as the last run left the outputs. The first so many files stood in the dependency
// file; a .cpp that did not was no header's own in that run.
void FindTailHolders(BuildFiles& builder, size_t knownFiles);
// Whether a .cpp that is not translated yet holds other tails than it would if it was written now.
bool TailsMoved(ScannedFile& file);
// Gives translation time 0 to each .cpp whose output does not agree with the imports as they are about to be saved: the
// run ended early, or wrote one file only.
void ForgetUnsettledTails(BuildFiles& builder);

}  // namespace qrex
