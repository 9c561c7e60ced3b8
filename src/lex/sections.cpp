#include "lex/sections.h"

namespace qrex {

namespace {

std::string_view BracketText(int32_t open) {
  switch (open) {
    case kOpenParen:
      return "(";
    case kOpenBrace:
      return "{";
    default:
      return "[";
  }
}

bool IsBlankInLine(char c) { return c == ' ' || c == '\t' || c == '\v' || c == '\f' || c == '\r'; }

void SkipBlanksInLine(LexScanner& scanner) {
  while (!scanner.AtEnd() && IsBlankInLine(*scanner.begin)) ++scanner.begin;
}

// From inside a bracket to its closing token, which is returned.
LexToken SkipToClose(LexScanner& scanner, int32_t open, int32_t close, const std::string& atEnd) {
  for (int64_t depth = 1;;) {
    const LexToken token = NextToken(scanner);
    if (token.kind == kEndOfText) throw LexScannerException(atEnd, scanner.begin);
    if (token.kind == open) ++depth;
    if (token.kind == close && --depth == 0) return token;
  }
}

// To the end of the last raw string that begins on the line, or on the one where such a string ends.
void SkipRawStringsOfLine(LexScanner& scanner) {
  LexScanner ahead = scanner;
  for (;;) {
    SkipBlanksInLine(ahead);
    if (ahead.AtEnd() || *ahead.begin == '\n') return;
    const LexToken token = NextToken(ahead, true);
    if (token.kind == kRawString) {
      scanner = ahead;
    } else if (token.text.View().find('\n') != std::string_view::npos) {
      return;
    }
  }
}

// Of the line on which the first token ends: a comment may run over several.
TextRange RestOfLine(LexScanner& scanner, const char* begin) {
  scanner.begin = begin;
  NextToken(scanner, true);
  if (scanner.dialect == Dialect::Cpp) SkipRawStringsOfLine(scanner);
  while (!scanner.AtEnd() && *scanner.begin != '\n' && *scanner.begin != '\r') ++scanner.begin;
  return {begin, scanner.begin};
}

// The last line feed of the body, and the closing bracket's own indentation, are no part of it.
const char* EndOfAllmanBody(const char* begin, const char* close) {
  const char* last = close - 1;
  while (last > begin && (*last == ' ' || *last == '\t')) --last;
  if (*last != '\n') return last + 1;
  return last > begin && last[-1] == '\r' ? last - 1 : last;
}

}  // namespace

TextRange ReadSection(LexScanner& scanner, bool openAlreadyRead, int32_t open, int32_t close) {
  if (!openAlreadyRead) {
    const LexToken token = NextToken(scanner);
    if (token.kind != open) {
      throw LexScannerException(std::string(BracketText(open)) + " expected when read " + Printed(token), token);
    }
  }
  SkipWhiteSpace(scanner);
  TextRange section(scanner.begin, scanner.begin);
  for (int64_t depth = 1;;) {
    const LexToken token = NextToken(scanner);
    if (token.kind == kEndOfText) throw LexScannerException("Met EOS while reading bracketted section", scanner.begin);
    if (token.kind == open) ++depth;
    if (token.kind == close && --depth == 0) return section;
    section.end = scanner.begin;
  }
}

TextRange ReadParenSection(LexScanner& scanner, bool openAlreadyRead) {
  return ReadSection(scanner, openAlreadyRead, kOpenParen, kCloseParen);
}

TextRange ReadBracketSection(LexScanner& scanner, bool openAlreadyRead) {
  return ReadSection(scanner, openAlreadyRead, kOpenBracket, kCloseBracket);
}

TextRange ReadBlock(LexScanner& scanner, int32_t open, int32_t close, const char* openText, const char* closeText,
                    bool required, int& indent) {
  indent = 0;
  SkipBlanksInLine(scanner);
  if (scanner.AtEnd()) {
    throw LexScannerException("Expected " + std::string(openText) + " when read EOS", scanner.begin);
  }
  const bool onThisLine = *scanner.begin != '\n';
  const char* const lineRest = scanner.begin;
  const LexToken first = NextToken(scanner);
  if (first.kind != open) {
    if (onThisLine && !required) return RestOfLine(scanner, lineRest);
    throw LexScannerException("Expected " + std::string(openText) + " when read " + Printed(first), first);
  }
  const std::string atEnd = "Met EOS before closing " + std::string(closeText);
  if (onThisLine) {
    if (scanner.AtEnd()) throw LexScannerException(atEnd, scanner.begin);
    if (!scanner.AtEnd() && *scanner.begin == '\r') ++scanner.begin;
    if (!scanner.AtEnd() && *scanner.begin == '\n') ++scanner.begin;
    const char* begin = scanner.begin;
    return {begin, SkipToClose(scanner, open, close, "Met EOS while reading bracketted string").text.begin};
  }
  SkipBlanksInLine(scanner);
  if (!scanner.AtEnd() && *scanner.begin == '\n') ++scanner.begin;
  for (; !scanner.AtEnd() && (*scanner.begin == ' ' || *scanner.begin == '\t'); ++scanner.begin) {
    indent += *scanner.begin == '\t' ? kTabWidth : 1;
  }
  const char* begin = scanner.begin;
  const LexToken closing = SkipToClose(scanner, open, close, atEnd);
  return {begin, EndOfAllmanBody(first.text.end, closing.text.begin)};
}

TextRange ReadBraceBlock(LexScanner& scanner, int& indent) {
  return ReadBlock(scanner, kOpenBrace, kCloseBrace, "{", "}", false, indent);
}

TextRange ReadParenBlock(LexScanner& scanner, int& indent) {
  return ReadBlock(scanner, kOpenParen, kCloseParen, "(", ")", true, indent);
}

void FailAtEndOfArgument(const LexScanner& scanner, const char* begin) {
  throw LexScannerException("Met EOS while reading argument " + std::string(begin, scanner.end), scanner.end);
}

}  // namespace qrex
