// The one tokeniser of every language of the system, and ParserBase with one token of look-back.
#pragma once

#include <string>
#include <string_view>

#include "lex/token.h"

namespace qrex {

// `begin` is the current position. A value: copy it to look ahead, assign the copy back to rewind.
struct LexScanner : TextRange {
  LexScanner() = default;
  explicit LexScanner(const TextRange& range) : TextRange(range) {}
  explicit LexScanner(std::string_view text) : TextRange(text) {}
  bool AtEnd() const { return begin >= end; }
};

// The next token. White space is skipped, comments (kComment) too unless kept; kMacroComment is always returned. At the
// end of the text: kEndOfText, again and again. Throws LexScannerException.
LexToken NextToken(LexScanner& scanner, bool keepComments = false);

void SkipWhiteSpace(LexScanner& scanner);
bool SkipDigits(LexScanner& scanner);
int64_t LineOfPosition(const TextRange& text, const char* position);  // 1-based; -1 outside
bool SameTokens(LexScanner a, LexScanner b);                          // same kinds and texts, comments dropped
bool IsIdentifierStart(char c);
bool IsIdentifierPart(char c);

class ParserBase {
 public:
  void SetInput(const TextRange& text);
  void Advance();
  void Expect(int32_t kind, std::string_view what);
  [[noreturn]] void FailExpected(std::string_view what) const;  // "Expected what after previous when read current"
  std::string ReadIdentifier();

  LexToken current;
  LexToken previous;
  LexScanner scanner;
};

}  // namespace qrex
