// Translating the text of one file: macro pass, main loop, tails.
#pragma once

#include "text/streams.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

// Runs the macro pass and the main loop over the file's source text, with head, tails and foot, into `target`. `kept`:
// the target, if it is to know what is copied.
void TranslateText(ScannedFile& file, IOutputStream& target, KeptOutput* kept = nullptr);

}  // namespace qrex
