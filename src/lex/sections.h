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

// One comma-separated argument; returns the token that ended it, `,` or `close`. `visit` gets each token of it; of one
// in back quotes, which is not read as tokens, just the first quote.
template <typename Visit>
LexToken ReadArgument(LexScanner& scanner, TextRange& argument, int32_t close, Visit visit);
inline LexToken ReadArgument(LexScanner& scanner, TextRange& argument, int32_t close) {
  return ReadArgument(scanner, argument, close, [](const LexToken&) {});
}

// --- Implementation

[[noreturn]] void FailAtEndOfArgument(const LexScanner& scanner, const char* begin);

template <Dialect dialect, typename Visit>
LexToken ReadArgumentOf(LexScanner& scanner, TextRange& argument, int32_t close, Visit visit) {
  const char* const begin = scanner.begin;
  LexScanner ahead = scanner;  // copies: they stay in registers
  LexToken token;
  int32_t nest = kNoToken;  // the opening bracket of the nest being read
  for (int64_t depth = 0;;) {
    const char* const behind = ahead.begin;
    ReadTokenOf<dialect>(ahead, token);
    if (token.kind == kEndOfText) FailAtEndOfArgument(ahead, begin);
    if (depth == 0) {
      if (token.kind == kComma || token.kind == close) {
        argument = TextRange(begin, behind);
        scanner = ahead;
        return token;
      }
      if (token.kind == kOpenParen || token.kind == kOpenBrace || token.kind == kOpenBracket) {
        nest = token.kind;
        depth = 1;
      }
    } else if (token.kind == nest) {
      ++depth;
    } else if (token.kind == nest + 1) {
      --depth;
    }
    visit(token);
  }
}

template <typename Visit>
LexToken ReadArgument(LexScanner& scanner, TextRange& argument, int32_t close, Visit visit) {
  SkipWhiteSpace(scanner);
  const char* const begin = scanner.begin;
  if (!scanner.AtEnd() && *begin == '`') {
    const size_t length = std::string_view(begin + 1, static_cast<size_t>(scanner.end - begin) - 1).find('`');
    if (length == std::string_view::npos) FailAtEndOfArgument(scanner, begin);
    argument = TextRange(begin + 1, begin + 1 + length);
    visit(LexToken{kBackquote, {begin, begin + 1}});
    scanner.begin = argument.end + 1;
    return NextToken(scanner);
  }
  return scanner.dialect == Dialect::Cpp ? ReadArgumentOf<Dialect::Cpp>(scanner, argument, close, visit)
                                         : ReadArgumentOf<Dialect::Qrex>(scanner, argument, close, visit);
}

}  // namespace qrex
