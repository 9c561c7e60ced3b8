// What C++ has and declarations don't: errors at such words tell what to write instead.
#pragma once

#include "lex/scanner.h"

namespace qrex {

// Adds a line to an error in `text` at a word that C++ would take there.
void AdviseOnCppWord(const TextRange& text, LexScannerException& exception);

}  // namespace qrex
