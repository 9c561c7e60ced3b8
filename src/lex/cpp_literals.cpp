#include "lex/cpp_literals.h"

#include <cstdlib>

#include "lex/literals.h"

namespace qrex {

namespace {

constexpr size_t kMostDelimiter = 16;  // of a raw string

bool IsDigit(char c) { return c >= '0' && c <= '9'; }
bool IsQuote(char c) { return c == '"' || c == '\''; }
bool IsWordPart(char c) { return IsIdentifierPart(c, ByteClassesOf(Dialect::Cpp)); }

bool IsEncoding(std::string_view prefix) { return prefix == "L" || prefix == "u" || prefix == "U" || prefix == "u8"; }

int DigitValue(char c) {
  if (IsDigit(c)) return c - '0';
  const char lower = static_cast<char>(c | 0x20);
  return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : 16;
}

int32_t KindOfNumber(std::string_view text) {
  const bool isHex = text.size() > 1 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X');
  size_t at = isHex ? 2 : 0;
  while (at < text.size() && (text[at] == '\'' || DigitValue(text[at]) < (isHex ? 16 : 10))) ++at;
  const char next = at < text.size() ? text[at] : '\0';
  const char lower = static_cast<char>(next | 0x20);
  if (next == '.' || lower == (isHex ? 'p' : 'e')) return kFloat;
  return isHex ? kHex : kDecimal;
}

// Behind the `"` of a raw string; the token began at `begin`. False without moving: it is no raw string.
bool ReadRawString(LexScanner& scanner, const char* begin) {
  const std::string_view text = scanner.View();
  const size_t open = text.substr(0, kMostDelimiter + 1).find_first_of("( )\\\t\v\f\n\"");
  if (open == std::string_view::npos || text[open] != '(') return false;
  const std::string close = ")" + std::string(text.substr(0, open)) + "\"";
  const size_t found = text.find(close, open + 1);
  if (found == std::string_view::npos) {
    throw LexScannerException("Met EOS within raw string " + std::string(begin, text.data() + open + 1), begin);
  }
  scanner.begin = text.data() + found + close.size();
  return true;
}

void AppendUtf8(std::string& out, uint32_t code) {
  const auto add = [&](uint32_t byte) { out += static_cast<char>(byte); };
  if (code < 0x80) {
    add(code);
  } else if (code < 0x800) {
    add(0xC0 | code >> 6);
    add(0x80 | (code & 0x3F));
  } else {
    if (code < 0x10000) {
      add(0xE0 | code >> 12);
    } else {
      add(0xF0 | (code >> 18 & 7));
      add(0x80 | (code >> 12 & 0x3F));
    }
    add(0x80 | (code >> 6 & 0x3F));
    add(0x80 | (code & 0x3F));
  }
}

// Takes up to `most` digits off the text.
uint32_t TakeDigits(std::string_view& text, int base, size_t most) {
  uint32_t value = 0;
  for (size_t i = 0; i < most && !text.empty() && DigitValue(text[0]) < base; ++i) {
    value = value * static_cast<uint32_t>(base) + static_cast<uint32_t>(DigitValue(text[0]));
    text.remove_prefix(1);
  }
  return value;
}

// `text` begins behind a backslash, and is not empty.
void DecodeEscape(std::string_view& text, std::string& out) {
  const char letter = text[0];
  if (letter >= '0' && letter <= '7') {
    out += static_cast<char>(TakeDigits(text, 8, 3));
    return;
  }
  text.remove_prefix(1);
  switch (letter) {
    case '\n':
      return;
    case 'x':
      out += static_cast<char>(TakeDigits(text, 16, text.size()));
      return;
    case 'u':
      return AppendUtf8(out, TakeDigits(text, 16, 4));
    case 'U':
      return AppendUtf8(out, TakeDigits(text, 16, 8));
    default:
      out += ByteOfEscape(letter);
  }
}

}  // namespace

int32_t ReadCppNumber(LexScanner& scanner) {
  const char* const begin = scanner.begin;
  const char* at = begin + 1;
  for (; at < scanner.end; ++at) {
    const char last = static_cast<char>(at[-1] | 0x20);
    if (IsWordPart(*at) || *at == '.') continue;
    if ((*at == '+' || *at == '-') && (last == 'e' || last == 'p')) continue;
    if (*at == '\'' && at + 1 < scanner.end && IsWordPart(at[1])) continue;
    break;
  }
  scanner.begin = at;
  return KindOfNumber({begin, static_cast<size_t>(at - begin)});
}

int32_t ReadCppDot(LexScanner& scanner) {
  if (scanner.end - scanner.begin >= 2 && IsDigit(scanner.begin[1])) return ReadCppNumber(scanner);
  ++scanner.begin;
  return kDot;
}

int32_t ReadCppWord(LexScanner& scanner) {
  const char* const begin = scanner.begin;
  SkipWord(scanner);
  if (scanner.AtEnd() || !IsQuote(*scanner.begin)) return kIdentifier;
  const std::string_view word(begin, static_cast<size_t>(scanner.begin - begin));
  if (IsEncoding(word)) return ReadCppQuoted(scanner);
  const std::string_view encoding = word.substr(0, word.size() - 1);
  if (word.back() != 'R' || *scanner.begin != '"' || (!encoding.empty() && !IsEncoding(encoding))) return kIdentifier;
  LexScanner behind = scanner;
  ++behind.begin;
  if (!ReadRawString(behind, begin)) return kIdentifier;
  scanner = behind;
  return kRawString;
}

int32_t ReadCppQuoted(LexScanner& scanner) {
  const char quote = *scanner.begin;
  const char* at = scanner.begin + 1;
  const char* const end = scanner.end;
  while (at < end && *at != quote && *at != '\n') at += *at == '\\' && end - at >= 2 ? 2 : 1;
  if (at == end || *at == '\n') {
    scanner.begin = at;
    return kStray;
  }
  scanner.begin = at + 1;
  return quote == '"' ? kDoubleQuoted : kSingleQuoted;
}

uint64_t IntegerValue(const LexToken& token, Dialect dialect) {
  if (dialect == Dialect::Qrex) return token.kind == kHex ? HexValue64(token) : DecimalValue64(token);
  std::string_view text = token.text.View();
  int base = 10;
  if (text.size() > 1 && text[0] == '0') {
    const bool isBinary = (text[1] | 0x20) == 'b';
    base = token.kind == kHex ? 16 : isBinary ? 2 : 8;
    text.remove_prefix(base == 8 ? 1 : 2);
  }
  uint64_t value = 0;
  for (; !text.empty() && (text[0] == '\'' || DigitValue(text[0]) < base); text.remove_prefix(1)) {
    if (text[0] != '\'') value = value * static_cast<uint64_t>(base) + static_cast<uint64_t>(DigitValue(text[0]));
  }
  if (text.find_first_not_of("uUlLzZ") != std::string_view::npos) {
    throw LexScannerException("No value can be told of " + Printed(token), token);
  }
  return value;
}

double FloatValue(const LexToken& token, Dialect dialect) {
  if (dialect == Dialect::Qrex) return FloatValue(token);
  std::string text = token.text.Text();
  std::erase(text, '\'');
  char* end = nullptr;
  const double value = std::strtod(text.c_str(), &end);
  if (std::string_view(end).find_first_not_of("fFlL") != std::string_view::npos) {
    throw LexScannerException("No value can be told of " + Printed(token), token);
  }
  return value;
}

void DecodeString(const LexToken& token, Dialect dialect, std::string& out) {
  if (dialect == Dialect::Qrex) return DecodeString(token, out);
  std::string_view text = token.text.View();
  text.remove_prefix(text.find_first_of("\"'") + 1);
  text.remove_suffix(1);
  if (token.kind == kRawString) {
    const size_t open = text.find('(');
    out.assign(text.substr(open + 1, text.size() - 2 * (open + 1)));
    return;
  }
  out.clear();
  for (size_t backslash; (backslash = text.find('\\')) + 1 < text.size() && backslash != std::string_view::npos;) {
    out.append(text.substr(0, backslash));
    text.remove_prefix(backslash + 1);
    DecodeEscape(text, out);
  }
  out.append(text);
}

}  // namespace qrex
