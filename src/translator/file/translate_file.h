// Translating one file: macro pass, main loop, tails; and writing what came of it.
#pragma once

#include "text/streams.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

// Translates the file and all that it imports, each once per run, and writes the output when `needsWriting` is set (and
// clears it). A file of a kind that is not translated is copied then.
void BringUpToDate(ScannedFile& file);

// Runs the macro pass and the main loop over the file's source text, with head, tails and foot, into `target`.
void TranslateFile(ScannedFile& file, IOutputStream& target);

}  // namespace qrex
