#include "lex/literals.h"

#include <cstdlib>

namespace qrex {

namespace {

struct Escape {
  char letter;
  char byte;
};
constexpr Escape kEscapes[] = {{'r', 13}, {'n', 10}, {'a', 7},   {'b', 8},     {'f', 12},    {'t', 9},
                               {'v', 11}, {'0', 0},  {'"', '"'}, {'\\', '\\'}, {'\'', '\''}, {'?', '?'}};

const Escape* EscapeOfLetter(char letter) {
  for (const Escape& escape : kEscapes) {
    if (escape.letter == letter) return &escape;
  }
  return nullptr;
}

int HexDigitValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  return -1;
}

bool IsHexDigit(const LexScanner& scanner) { return !scanner.AtEnd() && HexDigitValue(*scanner.begin) >= 0; }
bool IsDigit(const LexScanner& scanner) { return !scanner.AtEnd() && *scanner.begin >= '0' && *scanner.begin <= '9'; }
bool Is(const LexScanner& scanner, char c) { return !scanner.AtEnd() && *scanner.begin == c; }

std::string CharLiteral(char c) {
  std::string text;
  WriteCharLiteral(text, c);
  return text;
}

[[noreturn]] void Fail(const LexScanner& scanner, std::string message) {
  throw LexScannerException(std::move(message), scanner.begin);
}

// One of the two digits of \x; moves over it.
int ReadHexEscapeDigit(LexScanner& scanner) {
  if (scanner.AtEnd()) Fail(scanner, "Expected hex character when reached EOS");
  const int value = HexDigitValue(*scanner.begin);
  if (value < 0) Fail(scanner, "Expected hex character when read " + CharLiteral(*scanner.begin));
  ++scanner.begin;
  return value;
}

void ReadFraction(LexScanner& scanner, const char* begin) {
  ++scanner.begin;
  if (!IsDigit(scanner)) {
    Fail(scanner, "Expected digit (not " + PrintedByte(scanner) + ") after decimal point (ie after reading '" +
                      std::string(begin, scanner.begin) + "')");
  }
  SkipDigits(scanner);
}

void ReadExponent(LexScanner& scanner, const char* begin) {
  ++scanner.begin;
  if (Is(scanner, '+') || Is(scanner, '-')) ++scanner.begin;
  if (!IsDigit(scanner)) {
    Fail(scanner, "Expected digit(s) (not " + PrintedByte(scanner) + ") for exponent after reading " +
                      std::string(begin, scanner.begin));
  }
  SkipDigits(scanner);
}

}  // namespace

int32_t ReadNumber(LexScanner& scanner) {
  if (!IsDigit(scanner)) return -1;
  const char* const begin = scanner.begin;
  if (*begin == '0') {
    ++scanner.begin;
    if (Is(scanner, 'x') || Is(scanner, 'X')) {
      ++scanner.begin;
      if (!IsHexDigit(scanner)) Fail(scanner, "Expected hex digit (not " + PrintedByte(scanner) + ") after 0x");
      while (IsHexDigit(scanner)) ++scanner.begin;
      return kHex;
    }
  }
  SkipDigits(scanner);
  int32_t kind = kDecimal;
  if (Is(scanner, '.')) {
    ReadFraction(scanner, begin);
    kind = kFloat;
  }
  if (Is(scanner, 'e') || Is(scanner, 'E')) {
    ReadExponent(scanner, begin);
    kind = kFloat;
  }
  return kind;
}

bool ReadQuoted(LexScanner& scanner, char quote, std::string_view what) {
  const char* const begin = scanner.begin;
  if (scanner.AtEnd()) return false;
  const bool isRaw = (*begin == 'r' || *begin == 'R') && scanner.end - scanner.begin >= 2 && scanner.begin[1] == quote;
  if (!isRaw && *begin != quote) return false;
  scanner.begin += isRaw ? 2 : 1;
  if (scanner.AtEnd()) Fail(scanner, "Met EOS within " + std::string(what));
  auto soFar = [&] { return std::string(what) + " after reading " + std::string(begin, scanner.begin); };
  for (;;) {
    const char* at = scanner.begin;
    while (at < scanner.end && *at != quote && *at != '\n' && *at != '\\') ++at;
    scanner.begin = at;
    if (scanner.AtEnd()) Fail(scanner, "Met EOS within " + soFar());
    if (*at == quote) break;
    if (*at == '\n') Fail(scanner, "Met line feed within " + soFar());
    if (isRaw || !ReadEscape(scanner)) ++scanner.begin;
  }
  ++scanner.begin;
  return true;
}

bool ReadEscape(LexScanner& scanner) {
  if (!Is(scanner, '\\')) return false;
  ++scanner.begin;
  if (scanner.AtEnd()) Fail(scanner, "Expected escape character following backslash when reached EOS");
  if (*scanner.begin == 'x') {
    ++scanner.begin;
    ReadHexEscapeDigit(scanner);
    ReadHexEscapeDigit(scanner);
    return true;
  }
  if (!EscapeOfLetter(*scanner.begin)) {
    Fail(scanner, "Invalid escape character " + CharLiteral(*scanner.begin) + " following backslash");
  }
  ++scanner.begin;
  return true;
}

uint64_t DecimalValue64(const LexToken& token) {
  uint64_t value = 0;
  for (char digit : token.text.View()) value = value * 10 + static_cast<uint64_t>(digit - '0');
  return value;
}

uint32_t DecimalValue32(const LexToken& token) { return static_cast<uint32_t>(DecimalValue64(token)); }

uint64_t HexValue64(const LexToken& token) {
  uint64_t value = 0;
  for (char digit : token.text.View().substr(2)) value = (value << 4) + static_cast<uint64_t>(HexDigitValue(digit));
  return value;
}

double FloatValue(const LexToken& token) { return std::strtod(token.text.Text().c_str(), nullptr); }

void DecodeString(const LexToken& token, std::string& out) {
  std::string_view text = token.text.View();
  const bool isRaw = text.front() == 'r' || text.front() == 'R';
  text.remove_prefix(isRaw ? 2 : 1);
  text.remove_suffix(1);
  if (isRaw) {
    out.assign(text);
    return;
  }
  out.clear();
  out.reserve(text.size());
  for (size_t backslash; (backslash = text.find('\\')) != std::string_view::npos;) {
    out.append(text.substr(0, backslash));
    const char letter = text[backslash + 1];
    if (letter == 'x') {
      out += static_cast<char>(HexDigitValue(text[backslash + 2]) << 4 | HexDigitValue(text[backslash + 3]));
      text.remove_prefix(backslash + 4);
    } else {
      out += EscapeOfLetter(letter)->byte;
      text.remove_prefix(backslash + 2);
    }
  }
  out.append(text);
}

void ReadQuotedText(LexScanner& scanner, std::string& out) {
  out.clear();
  if (scanner.AtEnd()) Fail(scanner, "Expected quoted string");
  const char quote = *scanner.begin;
  if (quote != '"' && quote != '\'') Fail(scanner, scanner.Text() + " isn't a quoted string");
  ++scanner.begin;
  if (scanner.AtEnd()) Fail(scanner, "Expected quoted string");
  for (;;) {
    if (scanner.AtEnd()) Fail(scanner, "Met EOS in middle of string");
    const char c = *scanner.begin;
    if (c == quote) return;
    if (c == '\n') Fail(scanner, "Met end of line in middle of string");
    ++scanner.begin;
    if (c != '\\') {
      out += c;
      continue;
    }
    if (scanner.AtEnd()) Fail(scanner, "Met EOS in middle of string");
    const char letter = *scanner.begin;
    if (letter == 'x') {
      ++scanner.begin;
      const int high = ReadHexEscapeDigit(scanner);
      out += static_cast<char>(high << 4 | ReadHexEscapeDigit(scanner));
    } else if (const Escape* escape = EscapeOfLetter(letter)) {
      out += escape->byte;
      ++scanner.begin;
    } else {
      Fail(scanner, CharLiteral(letter) + "is not a valid escape character");
    }
  }
}

char ByteOfEscape(char letter) {
  const Escape* escape = EscapeOfLetter(letter);
  return escape ? escape->byte : letter;
}

void WriteEscapedChar(std::string& out, char c) {
  static constexpr char kDigits[] = "0123456789abcdef";
  for (const Escape& escape : kEscapes) {
    if (escape.byte != c) continue;
    out += '\\';
    out += escape.letter;
    return;
  }
  const unsigned char byte = static_cast<unsigned char>(c);
  if (byte >= 32 && byte <= 126) {
    out += c;
  } else {
    out += "\\x";
    out += kDigits[byte >> 4];
    out += kDigits[byte & 15];
  }
}

void WriteCharLiteral(std::string& out, char c) {
  out += '\'';
  WriteEscapedChar(out, c);
  out += '\'';
}

std::string EscapedString(std::string_view text) {
  std::string out;
  out.reserve(text.size());
  for (char c : text) WriteEscapedChar(out, c);
  return out;
}

std::string PrintedByte(const LexScanner& scanner) { return scanner.AtEnd() ? "EOS" : CharLiteral(*scanner.begin); }

}  // namespace qrex
