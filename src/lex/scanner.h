// The one tokeniser of every language of the system, and ParserBase with one token of look-back.
#pragma once

#include <string>
#include <string_view>

#include "lex/byte_class.h"
#include "lex/token.h"

namespace qrex {

// `begin` is the current position. A value: copy it to look ahead, assign the copy back to rewind.
struct LexScanner : TextRange {
  LexScanner() = default;
  explicit LexScanner(const TextRange& range) : TextRange(range) {}
  explicit LexScanner(std::string_view text) : TextRange(text) {}
  bool AtEnd() const { return begin >= end; }
};

inline void SkipWhiteSpace(LexScanner& scanner) {
  const char* at = scanner.begin;  // a copy: it stays in a register
  while (at < scanner.end && IsBlankByte(*at)) ++at;
  scanner.begin = at;
}

inline void SkipWord(LexScanner& scanner) {  // what continues an identifier
  const char* at = scanner.begin;
  while (at < scanner.end && IsIdentifierPart(*at)) ++at;
  scanner.begin = at;
}

// Steps over what is more than a word or a single character; the scanner stands on its first byte. The token's kind.
int32_t ScanLongToken(LexScanner& scanner);

// The next token. White space is skipped, comments (kComment) too unless kept; kMacroComment is always returned. At the
// end of the text: kEndOfText, again and again. Throws LexScannerException.
inline void ReadToken(LexScanner& scanner, LexToken& token, bool keepComments = false) {
  do {
    SkipWhiteSpace(scanner);
    token.text.begin = scanner.begin;
    if (scanner.AtEnd()) {
      token.kind = kEndOfText;
    } else {
      const char c = *scanner.begin;
      const uint8_t byteClass = ByteClassOf(c);
      if (byteClass == kLetterByte && c != 'r' && c != 'R') {  // these may begin a raw string
        SkipWord(scanner);
        token.kind = kIdentifier;
      } else if (byteClass == kSingleByte) {
        ++scanner.begin;
        token.kind = SingleToken(c);
      } else {
        token.kind = ScanLongToken(scanner);
      }
    }
    token.text.end = scanner.begin;
  } while (token.kind == kComment && !keepComments);
}

inline LexToken NextToken(LexScanner& scanner, bool keepComments = false) {
  LexToken token;
  ReadToken(scanner, token, keepComments);
  return token;
}

bool SkipDigits(LexScanner& scanner);
int64_t LineOfPosition(const TextRange& text, const char* position);  // 1-based; -1 outside
bool SameTokens(LexScanner a, LexScanner b);                          // same kinds and texts, comments dropped

class ParserBase {
 public:
  void SetInput(const TextRange& text);
  void Advance();
  template <typename Stop>
  void AdvanceUntil(Stop stop) {  // at least once, to the next token that `stop` takes
    LexScanner ahead = scanner;
    LexToken tokens[2] = {current, current};  // in turn: nothing is copied on the way
    size_t last = 0;
    do {
      last ^= 1;
      ReadToken(ahead, tokens[last]);
    } while (!stop(tokens[last]));
    previous = tokens[last ^ 1];
    current = tokens[last];
    scanner = ahead;
  }
  void Expect(int32_t kind, std::string_view what);
  [[noreturn]] void FailExpected(std::string_view what) const;  // "Expected what after previous when read current"
  std::string ReadIdentifier();

  LexToken current;
  LexToken previous;
  LexScanner scanner;
};

}  // namespace qrex
