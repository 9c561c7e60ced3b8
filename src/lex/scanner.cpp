// The tokeniser. One table tells for each byte which class of token it can begin, so that a token costs one look-up and
// the walk over its own bytes; words and single characters are read by ReadToken itself. The classes and their order
// are those of the languages: a number, then a quoted string (ahead of identifiers, because of its raw prefix), an
// identifier, a comment, then operators.

#include "lex/scanner.h"

#include <algorithm>
#include <array>
#include <cstring>

#include "lex/cpp_literals.h"
#include "lex/literals.h"

namespace qrex {

namespace {

// Operators by their first byte: with `=`, doubled, doubled with `=`. kNoToken: no such form.
struct OperatorForms {
  char first;
  int32_t withAssign, doubled, doubledAssign;
};
constexpr OperatorForms kOperators[] = {
    {'+', kPlusAssign, kPlusPlus, kNoToken},
    {'<', kLessEqual, kShiftLeft, kShiftLeftAssign},
    {'>', kGreaterEqual, kShiftRight, kShiftRightAssign},
    {'&', kAndAssign, kAndAnd, kAndAndAssign},
    {'|', kOrAssign, kOrOr, kOrOrAssign},
    {'^', kXorAssign, kXorXor, kXorXorAssign},
    {'-', kMinusAssign, kMinusMinus, kMinusMinus},
    {'*', kStarAssign, kNoToken, kNoToken},
    {'/', kSlashAssign, kNoToken, kNoToken},
    {'%', kPercentAssign, kNoToken, kNoToken},
    {'!', kNotEqual, kNoToken, kNoToken},
    {'=', kEqual, kNoToken, kNoToken},
    {'?', kQuestionAssign, kNoToken, kNoToken},
    {':', kNoToken, kColonColon, kColonColon},
    {'$', kNoToken, kDollarDollar, kDollarDollar},
    {'@', kNoToken, kNoToken, kNoToken},
};

constexpr std::array<int8_t, 128> MakeOperatorIndex() {
  std::array<int8_t, 128> index{};
  for (int8_t& entry : index) entry = -1;
  for (size_t i = 0; i < std::size(kOperators); ++i) {
    index[static_cast<unsigned char>(kOperators[i].first)] = static_cast<int8_t>(i);
  }
  return index;
}
constexpr std::array<int8_t, 128> kOperatorIndex = MakeOperatorIndex();

bool NextIs(const LexScanner& scanner, char c) { return scanner.begin < scanner.end && *scanner.begin == c; }

int32_t ScanOperator(LexScanner& scanner) {
  const char* const begin = scanner.begin;
  const char first = *scanner.begin++;
  const OperatorForms& forms = kOperators[static_cast<uint8_t>(kOperatorIndex[static_cast<unsigned char>(first)])];
  if (first == '-' && NextIs(scanner, '>')) {
    ++scanner.begin;
    return kArrow;
  }
  if (forms.doubled != kNoToken && NextIs(scanner, first)) {
    ++scanner.begin;
    if (forms.doubledAssign == forms.doubled || !NextIs(scanner, '=')) return forms.doubled;
    if (scanner.dialect == Dialect::Cpp && first != '<' && first != '>') return forms.doubled;
    ++scanner.begin;
    if (forms.doubledAssign == kNoToken) {
      throw LexScannerException("Invalid token " + std::string(begin, scanner.begin), scanner.begin);
    }
    return forms.doubledAssign;
  }
  if (forms.withAssign != kNoToken && NextIs(scanner, '=')) {
    ++scanner.begin;
    return forms.withAssign;
  }
  return OneByteToken(first);
}

// False without moving when no comment starts here.
bool ScanComment(LexScanner& scanner) {
  if (scanner.end - scanner.begin < 2 || scanner.begin[0] != '/') return false;
  if (scanner.begin[1] == '/') {
    const char* at = scanner.begin + 2;
    do {
      const void* lineFeed = std::memchr(at, '\n', static_cast<size_t>(scanner.end - at));
      scanner.begin = lineFeed ? static_cast<const char*>(lineFeed) : scanner.end;
      at = scanner.begin + 1;
    } while (scanner.dialect == Dialect::Cpp && !scanner.AtEnd() && scanner.begin[-1] == '\\');
    return true;
  }
  if (scanner.begin[1] != '*') return false;
  const std::string_view body(scanner.begin + 2, static_cast<size_t>(scanner.end - scanner.begin) - 2);
  const size_t close = body.find("*/");
  if (close == std::string_view::npos) {
    throw LexScannerException("Met EOS in middle of /* ... */ comment", scanner.end);
  }
  scanner.begin = body.data() + close + 2;
  return true;
}

}  // namespace

int32_t ScanLongToken(LexScanner& scanner) {
  const bool isCpp = scanner.dialect == Dialect::Cpp;
  const char c = *scanner.begin;
  switch (ByteClassOf(c, ByteClassesOf(scanner.dialect))) {
    case kDigitByte:
      return isCpp ? ReadCppNumber(scanner) : ReadNumber(scanner);
    case kPrefixByte:
      if (isCpp) return ReadCppWord(scanner);
      if (scanner.end - scanner.begin >= 2) {
        if (scanner.begin[1] == '\'' && ReadQuoted(scanner, '\'', "single quoted string")) return kSingleQuoted;
        if (scanner.begin[1] == '"' && ReadQuoted(scanner, '"', "double quoted string")) return kDoubleQuoted;
      }
      SkipWord(scanner);
      return kIdentifier;
    case kQuoteByte:
      if (isCpp) return ReadCppQuoted(scanner);
      if (c == '\'') {
        ReadQuoted(scanner, '\'', "single quoted string");
        return kSingleQuoted;
      }
      ReadQuoted(scanner, '"', "double quoted string");
      return kDoubleQuoted;
    case kOperatorByte:
      if (c == '/' && ScanComment(scanner)) return kComment;
      if (c == '@') {
        LexScanner behind = scanner;
        ++behind.begin;
        if (ScanComment(behind)) {
          scanner = behind;
          return kMacroComment;
        }
      }
      return ScanOperator(scanner);
    case kDotByte:
      return ReadCppDot(scanner);
    default:
      if (isCpp) {
        ++scanner.begin;
        return kStray;
      }
      throw LexScannerException(std::string("Bad token ") + c, scanner.begin);
  }
}

bool SkipDigits(LexScanner& scanner) {
  const char* const begin = scanner.begin;
  const char* at = begin;
  while (at < scanner.end && ByteClassOf(*at) == kDigitByte) ++at;
  scanner.begin = at;
  return at > begin;
}

const char* EndOfWord(const TextRange& text, const char* position) {
  const char* end = position;
  while (end < text.end && IsIdentifierPart(*end)) ++end;
  return end == position && end < text.end ? end + 1 : end;
}

int64_t LineOfPosition(const TextRange& text, const char* position) {
  if (!text.Contains(position)) return -1;
  int64_t line = 1;
  for (const char* at = text.begin; at < position; ++line) {
    const void* lineFeed = std::memchr(at, '\n', static_cast<size_t>(position - at));
    if (!lineFeed) break;
    at = static_cast<const char*>(lineFeed) + 1;
  }
  return line;
}

LineStarts::LineStarts(const TextRange& text) : m_text(text), m_starts{text.begin} {
  const char* at = text.begin;
  while (const void* lineFeed = std::memchr(at, '\n', static_cast<size_t>(text.end - at))) {
    m_starts.push_back(at = static_cast<const char*>(lineFeed) + 1);
  }
}

int64_t LineStarts::LineOf(const char* position) const {
  if (!m_text.Contains(position)) return -1;
  return std::upper_bound(m_starts.begin(), m_starts.end(), position) - m_starts.begin();
}

bool SameTokens(LexScanner a, LexScanner b, Lines lines) {
  const auto linesTo = [](const char* begin, const LexToken& token) {
    return std::count(begin, token.text.begin, '\n');
  };
  for (;;) {
    const char *const aheadOfA = a.begin, *const aheadOfB = b.begin;
    const LexToken tokenA = NextToken(a);
    const LexToken tokenB = NextToken(b);
    if (tokenA.kind != tokenB.kind) return false;
    if (tokenA.kind == kEndOfText) return true;
    if (!(tokenA.text == tokenB.text)) return false;
    if (lines == Lines::Counted && linesTo(aheadOfA, tokenA) != linesTo(aheadOfB, tokenB)) return false;
  }
}

void ParserBase::SetInput(const TextRange& text, Dialect dialect) {
  scanner = LexScanner(text, dialect);
  Advance();
}

void ParserBase::Advance() {
  previous = current;
  current = NextToken(scanner);
}

void ParserBase::Expect(int32_t kind, std::string_view what) {
  if (current.kind != kind) FailExpected(what);
  Advance();
}

void ParserBase::FailExpected(std::string_view what) const {
  throw LexScannerException(
      "Expected " + std::string(what) + " after " + Printed(previous) + " when read " + Printed(current), current);
}

std::string ParserBase::ReadIdentifier() {
  if (current.kind != kIdentifier) FailExpected("identifier");
  std::string name = current.text.Text();
  Advance();
  return name;
}

std::string Printed(const LexToken& token) { return token.text.Empty() ? "EOS" : token.text.Text(); }

void LexScannerException::Write(TextWriter& writer) const {
  if (!file.empty()) {
    writer << file;
    if (line >= 0) writer << "(" << line << ")";
    writer << " : ";
  } else if (line >= 0) {
    writer << "Line " << line << ": ";
  }
  writer << "error : " << message;
}

}  // namespace qrex
