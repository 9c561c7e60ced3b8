// The tokeniser. One table tells for each byte which class of token it can begin, so that a token costs one look-up and
// the walk over its own bytes. The classes and their order are those of the languages: a number, then a quoted string
// (ahead of identifiers, because of its raw prefix), an identifier, a comment, then operators.

#include "lex/scanner.h"

#include <array>
#include <cstring>

#include "lex/literals.h"

namespace qrex {

namespace {

enum class ByteClass : uint8_t { Bad, Blank, Letter, Digit, Quote, Operator };

constexpr std::array<ByteClass, 256> MakeClasses() {
  std::array<ByteClass, 256> classes{};
  classes[' '] = ByteClass::Blank;
  for (int c = 9; c <= 13; ++c) classes[static_cast<size_t>(c)] = ByteClass::Blank;
  for (int c = 'a'; c <= 'z'; ++c) classes[static_cast<size_t>(c)] = ByteClass::Letter;
  for (int c = 'A'; c <= 'Z'; ++c) classes[static_cast<size_t>(c)] = ByteClass::Letter;
  classes['_'] = ByteClass::Letter;
  for (int c = '0'; c <= '9'; ++c) classes[static_cast<size_t>(c)] = ByteClass::Digit;
  classes['"'] = classes['\''] = ByteClass::Quote;
  for (const char* c = "+<>&|^-*/%!=?:$#.,;(){}[]~@\\`"; *c; ++c) {
    classes[static_cast<unsigned char>(*c)] = ByteClass::Operator;
  }
  return classes;
}
constexpr std::array<ByteClass, 256> kClasses = MakeClasses();

ByteClass ClassOf(char c) { return kClasses[static_cast<unsigned char>(c)]; }

// Operators by their first byte: alone, with `=`, doubled, doubled with `=`. kNoToken: no such form.
struct OperatorForms {
  char first;
  int32_t alone, withAssign, doubled, doubledAssign;
};
constexpr OperatorForms kOperators[] = {
    {'+', kPlus, kPlusAssign, kPlusPlus, kNoToken},
    {'<', kLess, kLessEqual, kShiftLeft, kShiftLeftAssign},
    {'>', kGreater, kGreaterEqual, kShiftRight, kShiftRightAssign},
    {'&', kAnd, kAndAssign, kAndAnd, kAndAndAssign},
    {'|', kOr, kOrAssign, kOrOr, kOrOrAssign},
    {'^', kXor, kXorAssign, kXorXor, kXorXorAssign},
    {'-', kMinus, kMinusAssign, kMinusMinus, kMinusMinus},
    {'*', kStar, kStarAssign, kNoToken, kNoToken},
    {'/', kSlash, kSlashAssign, kNoToken, kNoToken},
    {'%', kPercent, kPercentAssign, kNoToken, kNoToken},
    {'!', kNot, kNotEqual, kNoToken, kNoToken},
    {'=', kAssign, kEqual, kNoToken, kNoToken},
    {'?', kQuestion, kQuestionAssign, kNoToken, kNoToken},
    {':', kColon, kNoToken, kColonColon, kColonColon},
    {'$', kDollar, kNoToken, kDollarDollar, kDollarDollar},
    {'.', kDot, kNoToken, kNoToken, kNoToken},
    {',', kComma, kNoToken, kNoToken, kNoToken},
    {';', kSemicolon, kNoToken, kNoToken, kNoToken},
    {'(', kOpenParen, kNoToken, kNoToken, kNoToken},
    {')', kCloseParen, kNoToken, kNoToken, kNoToken},
    {'{', kOpenBrace, kNoToken, kNoToken, kNoToken},
    {'}', kCloseBrace, kNoToken, kNoToken, kNoToken},
    {'[', kOpenBracket, kNoToken, kNoToken, kNoToken},
    {']', kCloseBracket, kNoToken, kNoToken, kNoToken},
    {'~', kTilde, kNoToken, kNoToken, kNoToken},
    {'@', kAt, kNoToken, kNoToken, kNoToken},
    {'\\', kBackslash, kNoToken, kNoToken, kNoToken},
    {'`', kBackquote, kNoToken, kNoToken, kNoToken},
    {'#', kHash, kNoToken, kNoToken, kNoToken},
};

constexpr std::array<int8_t, 128> MakeOperatorIndex() {
  std::array<int8_t, 128> index{};
  for (int8_t& entry : index) entry = -1;
  for (size_t i = 0; i < std::size(kOperators); ++i) {
    index[static_cast<size_t>(kOperators[i].first)] = static_cast<int8_t>(i);
  }
  return index;
}
constexpr std::array<int8_t, 128> kOperatorIndex = MakeOperatorIndex();

bool NextIs(const LexScanner& scanner, char c) { return scanner.begin < scanner.end && *scanner.begin == c; }

int32_t ScanOperator(LexScanner& scanner) {
  const char* const begin = scanner.begin;
  const char first = *scanner.begin++;
  const OperatorForms& forms = kOperators[static_cast<size_t>(kOperatorIndex[static_cast<size_t>(first)])];
  if (first == '-' && NextIs(scanner, '>')) {
    ++scanner.begin;
    return kArrow;
  }
  if (forms.doubled != kNoToken && NextIs(scanner, first)) {
    ++scanner.begin;
    if (forms.doubledAssign == forms.doubled || !NextIs(scanner, '=')) return forms.doubled;
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
  return forms.alone;
}

// False without moving when no comment starts here.
bool ScanComment(LexScanner& scanner) {
  if (scanner.end - scanner.begin < 2 || scanner.begin[0] != '/') return false;
  const size_t rest = static_cast<size_t>(scanner.end - scanner.begin) - 2;
  if (scanner.begin[1] == '/') {
    const void* lineFeed = std::memchr(scanner.begin + 2, '\n', rest);
    scanner.begin = lineFeed ? static_cast<const char*>(lineFeed) : scanner.end;
    return true;
  }
  if (scanner.begin[1] != '*') return false;
  const std::string_view body(scanner.begin + 2, rest);
  const size_t close = body.find("*/");
  if (close == std::string_view::npos) {
    throw LexScannerException("Met EOS in middle of /* ... */ comment", scanner.end);
  }
  scanner.begin = body.data() + close + 2;
  return true;
}

int32_t ScanToken(LexScanner& scanner) {
  const char c = *scanner.begin;
  switch (ClassOf(c)) {
    case ByteClass::Digit:
      return ReadNumber(scanner);
    case ByteClass::Letter:
      if ((c == 'r' || c == 'R') && scanner.end - scanner.begin >= 2) {
        if (scanner.begin[1] == '\'' && ReadQuoted(scanner, '\'', "single quoted string")) return kSingleQuoted;
        if (scanner.begin[1] == '"' && ReadQuoted(scanner, '"', "double quoted string")) return kDoubleQuoted;
      }
      do {
        ++scanner.begin;
      } while (scanner.begin < scanner.end && IsIdentifierPart(*scanner.begin));
      return kIdentifier;
    case ByteClass::Quote:
      if (c == '\'') {
        ReadQuoted(scanner, '\'', "single quoted string");
        return kSingleQuoted;
      }
      ReadQuoted(scanner, '"', "double quoted string");
      return kDoubleQuoted;
    case ByteClass::Operator:
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
    default:
      throw LexScannerException("Bad token " + PrintedByte(scanner), scanner.begin);
  }
}

}  // namespace

LexToken NextToken(LexScanner& scanner, bool keepComments) {
  LexToken token;
  do {
    SkipWhiteSpace(scanner);
    if (scanner.AtEnd()) {
      token.kind = kEndOfText;
      token.text = scanner;
      return token;
    }
    token.text.begin = scanner.begin;
    token.kind = ScanToken(scanner);
    token.text.end = scanner.begin;
  } while (token.kind == kComment && !keepComments);
  return token;
}

void SkipWhiteSpace(LexScanner& scanner) {
  while (scanner.begin < scanner.end && ClassOf(*scanner.begin) == ByteClass::Blank) ++scanner.begin;
}

bool SkipDigits(LexScanner& scanner) {
  const char* const begin = scanner.begin;
  while (scanner.begin < scanner.end && ClassOf(*scanner.begin) == ByteClass::Digit) ++scanner.begin;
  return scanner.begin > begin;
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

bool SameTokens(LexScanner a, LexScanner b) {
  for (;;) {
    const LexToken tokenA = NextToken(a);
    const LexToken tokenB = NextToken(b);
    if (tokenA.kind != tokenB.kind) return false;
    if (tokenA.kind == kEndOfText) return true;
    if (!(tokenA.text == tokenB.text)) return false;
  }
}

bool IsIdentifierStart(char c) { return ClassOf(c) == ByteClass::Letter; }
bool IsIdentifierPart(char c) { return ClassOf(c) == ByteClass::Letter || ClassOf(c) == ByteClass::Digit; }

void ParserBase::SetInput(const TextRange& text) {
  scanner = LexScanner(text);
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
