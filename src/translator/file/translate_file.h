// Translating one file with all that it imports, and writing what came of it.
#pragma once

#include "text/streams.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

// The translation of a file failed, in a run that keeps going: the error has been told, and nothing is to be done.
class FaultyFileException : public LexScannerException {
 public:
  using LexScannerException::LexScannerException;
};

bool IsTranslatedKind(FileKind kind);  // others are copied

// Translates the file and all that it imports, each once per run, and writes the output when `needsWriting` is set (and
// clears it). A file of a kind that is not translated is copied then. In a run that keeps going a file that has an
// error, or imports one that has, raises a FaultyFileException, however often it is asked for.
void BringUpToDate(ScannedFile& file);

// The same of a translation that has not begun, but for the output: the generated text goes to `target`, with line
// feeds. Where no file asks for writing, this reads texts and does nothing else: no clock is asked, nothing is written.
void TranslateInto(ScannedFile& file, IOutputStream& target);

}  // namespace qrex
