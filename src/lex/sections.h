// Readers that delimit a stretch of source without interpreting it: a bracketed section, a body with layout rules, an
// argument. They run over real tokens, so brackets in strings and comments do not count, and return raw ranges.
#pragma once

#include "lex/scanner.h"

namespace qrex {

constexpr int kTabWidth = 4;  // the columns that a tab counts, everywhere

TextRange ReadSection(LexScanner& scanner, bool openAlreadyRead, int32_t open, int32_t close);
TextRange ReadParenSection(LexScanner& scanner, bool openAlreadyRead);
TextRange ReadBracketSection(LexScanner& scanner, bool openAlreadyRead);

TextRange ReadBlock(LexScanner& scanner, int32_t open, int32_t close, const char* openText, const char* closeText,
                    bool required, int& indent);
TextRange ReadBraceBlock(LexScanner& scanner, int& indent);  // optional braces: else the rest of the line
TextRange ReadParenBlock(LexScanner& scanner, int& indent);  // required parentheses

// One comma-separated argument; returns the token that ended it, `,` or `close`.
LexToken ReadArgument(LexScanner& scanner, TextRange& argument, int32_t close);

}  // namespace qrex
