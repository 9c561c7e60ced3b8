// The one tokeniser of every language of the system, and ParserBase with one token of look-back.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "lex/byte_class.h"
#include "lex/token.h"

namespace qrex {

// `begin` is the current position. A value: copy it to look ahead, assign the copy back to rewind.
struct LexScanner : TextRange {
  LexScanner() = default;
  explicit LexScanner(const TextRange& range, Dialect dialect = Dialect::Qrex) : TextRange(range), dialect(dialect) {}
  explicit LexScanner(std::string_view text, Dialect dialect = Dialect::Qrex) : TextRange(text), dialect(dialect) {}
  bool AtEnd() const { return begin >= end; }

  Dialect dialect = Dialect::Qrex;
};

inline void SkipWhiteSpace(LexScanner& scanner) {
  const char* at = scanner.begin;  // a copy: it stays in a register
  while (at < scanner.end && IsBlankByte(*at)) ++at;
  scanner.begin = at;
}

// Behind what continues an identifier. The end of the text is asked for once for four bytes.
inline const char* EndOfWord(const char* at, const char* end, const ByteClasses& classes) {
  for (; end - at >= 4; at += 4) {
    for (int i = 0; i < 4; ++i) {
      if (!IsIdentifierPart(at[i], classes)) return at + i;
    }
  }
  while (at < end && IsIdentifierPart(*at, classes)) ++at;
  return at;
}

inline void SkipWord(LexScanner& scanner) {
  scanner.begin = EndOfWord(scanner.begin, scanner.end, ByteClassesOf(scanner.dialect));
}

// Behind a number of digits alone, of which the first is at `at`; null when it may have another form.
inline const char* EndOfDigits(const char* at, const char* end) {
  do ++at;
  while (at < end && ByteClassOf(*at) == kDigitByte);
  const bool isPlain = at == end || *at == ' ' || *at == '\n' || (ByteClassOf(*at) == kSingleByte && *at != '.');
  return isPlain ? at : nullptr;
}

// Steps over what is not known by its first bytes for a word or a single character; the scanner stands on its first
// byte. The token's kind.
int32_t ScanLongToken(LexScanner& scanner);

// The next token. White space is skipped, comments (kComment) too unless kept; kMacroComment is always returned. At the
// end of the text: kEndOfText, again and again. Throws LexScannerException.
template <Dialect dialect>
inline void ReadTokenOf(LexScanner& scanner, LexToken& token, bool keepComments = false) {
  constexpr const ByteClasses& classes = kByteClasses[static_cast<size_t>(dialect)];
  const char* at = scanner.begin;  // as in the skips above
  const char* const end = scanner.end;
  do {
    while (at < end && IsBlankByte(*at)) ++at;
    token.text.begin = at;
    if (at >= end) {
      token.kind = kEndOfText;
    } else {
      const char c = *at;
      const uint8_t byteClass = ByteClassOf(c, classes);
      if (byteClass == kLetterByte) {
        at = EndOfWord(at + 1, end, classes);
        token.kind = kIdentifier;
      } else if (byteClass == kSingleByte ||
                 (byteClass == kOperatorByte && end - at >= 2 && ByteClassOf(at[1], classes) != kOperatorByte)) {
        ++at;
        token.kind = OneByteToken(c);
      } else if (const char* behind =
                     byteClass == kDigitByte && dialect == Dialect::Qrex ? EndOfDigits(at, end) : nullptr) {
        at = behind;
        token.kind = kDecimal;
      } else {
        LexScanner rest(TextRange(at, end), dialect);
        token.kind = ScanLongToken(rest);
        at = rest.begin;
      }
    }
    token.text.end = at;
  } while (token.kind == kComment && !keepComments);
  scanner.begin = at;
}

// Loops over many tokens ask for the dialect once, and call the above.
inline void ReadToken(LexScanner& scanner, LexToken& token, bool keepComments = false) {
  if (scanner.dialect == Dialect::Cpp) {
    ReadTokenOf<Dialect::Cpp>(scanner, token, keepComments);
  } else {
    ReadTokenOf<Dialect::Qrex>(scanner, token, keepComments);
  }
}

inline LexToken NextToken(LexScanner& scanner, bool keepComments = false) {
  LexToken token;
  ReadToken(scanner, token, keepComments);
  return token;
}

bool SkipDigits(LexScanner& scanner);
const char* EndOfWord(const TextRange& text, const char* position);   // of one byte where no word begins
int64_t LineOfPosition(const TextRange& text, const char* position);  // 1-based; -1 outside
// The same for many positions in one text, which must stay where it is.
class LineStarts {
 public:
  explicit LineStarts(const TextRange& text);
  int64_t LineOf(const char* position) const;

 private:
  TextRange m_text;
  std::vector<const char*> m_starts;
};
// Same kinds and texts, comments dropped; where lines count, also as many lines ahead of each.
enum class Lines { Ignored, Counted };
bool SameTokens(LexScanner a, LexScanner b, Lines lines = Lines::Ignored);

class ParserBase {
 public:
  void SetInput(const TextRange& text, Dialect dialect = Dialect::Qrex);
  void Advance();
  template <typename Stop>
  void AdvanceUntil(Stop stop) {  // at least once, to the next token that `stop` takes
    if (scanner.dialect == Dialect::Cpp) {
      AdvanceUntilIn<Dialect::Cpp>(stop);
    } else {
      AdvanceUntilIn<Dialect::Qrex>(stop);
    }
  }
  void Expect(int32_t kind, std::string_view what);
  [[noreturn]] void FailExpected(std::string_view what) const;  // "Expected what after previous when read current"
  std::string ReadIdentifier();

  LexToken current;
  LexToken previous;
  LexScanner scanner;

 private:
  template <Dialect dialect, typename Stop>
  void AdvanceUntilIn(Stop stop) {
    LexScanner ahead = scanner;  // copies: they stay in registers
    LexToken token = current;
    const char* before;
    do {
      before = token.text.begin;
      ReadTokenOf<dialect>(ahead, token);
    } while (!stop(token));
    previous = current;
    if (before != current.text.begin) {  // read once more: nothing is kept on the way
      LexScanner again(TextRange(before, ahead.end), dialect);
      ReadToken(again, previous);
    }
    current = token;
    scanner = ahead;
  }
};

}  // namespace qrex
