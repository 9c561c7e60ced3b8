#include "translator/code_block.h"

#include <algorithm>

#include "translator/keywords.h"

namespace qrex {

namespace {

constexpr std::string_view kWordsInCode[] = {"this", "class", "struct", "mixin", "interface", "enum", "variant", "new"};

// At the `$`; true when the word behind it was dealt with.
bool ReplaceItem(QrexParser& parser, ClassDef& def) {
  LexScanner ahead = parser.scanner;
  const LexToken word = NextToken(ahead);
  if (std::find(std::begin(kWordsInCode), std::end(kWordsInCode), word.text.View()) == std::end(kWordsInCode)) {
    return false;
  }
  for (const ClassKeyword& keyword : ClassLevelKeywords()) {
    if (!word.Is(keyword.word)) continue;
    parser.CopyToCurrent();
    parser.Advance();
    keyword.parse(parser, def);
    if (!keyword.advancesItself) parser.Advance();
    return true;
  }
  return false;
}

std::string Trimmed(const char* begin, const char* end) {
  while (begin < end && (*begin == ' ' || (*begin >= 9 && *begin <= 13))) ++begin;
  while (begin < end && (end[-1] == ' ' || (end[-1] >= 9 && end[-1] <= 13))) --end;
  return std::string(begin, end);
}

}  // namespace

void CopyCodeBlock(QrexParser& parser, ClassDef& def) {
  NestingGuard guard(parser);
  if (!parser.Is(kOpenBrace)) parser.FailExpected("{");
  parser.DropToCurrent();
  for (int64_t depth = 0;;) {
    if (parser.Is(kEndOfText)) parser.Fail("Met EOS before read matching brace");
    if (parser.Is(kDollarDollar)) {
      parser.CopyToCurrent();
      parser.DropBehindCurrent();
      parser.out << def.name;
      parser.Flush();
    } else if (parser.Is(kDollar)) {
      if (ReplaceItem(parser, def)) continue;
    } else if (parser.Is(kOpenBrace)) {
      ++depth;
    } else if (parser.Is(kCloseBrace) && --depth == 0) {
      break;
    }
    parser.Advance();
  }
  parser.Advance();
  parser.CopyToCurrent();
  parser.out << "\n";
  parser.Flush();
}

std::string ReadBraceContent(QrexParser& parser) {
  if (!parser.Is(kOpenBrace)) parser.FailExpected("{");
  const char* const begin = parser.current.text.end;
  parser.SkipToMatching(kOpenBrace, kCloseBrace, "Met EOS before read matching brace");
  return Trimmed(begin, parser.current.text.begin);
}

std::string ReadShortBody(QrexParser& parser, const std::string& name) {
  if (parser.Is(kOpenBrace)) {
    std::string body = ReadBraceContent(parser);
    parser.Advance();
    if (!parser.Is(kSemicolon)) parser.FailExpected(";");
    return body;
  }
  const char* const begin = parser.current.text.begin;
  while (!parser.Is(kSemicolon)) {
    if (parser.Is(kEndOfText)) parser.Fail("Met EOS while scanning forwards for semicolon");
    parser.Advance();
  }
  return name + " = " + Trimmed(begin, parser.current.text.begin) + ";";
}

std::string_view PassingSuffix(std::string_view type) {
  const std::string_view code = SkipMetadata(type);
  const uint8_t op = code.empty() ? 0 : static_cast<uint8_t>(code.front());
  return (op >= kOpBool && op <= kOpChar16) || op == kOpPointer ? "" : " const&";
}

NodeHead ReadNodeHead(QrexParser& parser, const ClassDef& def) {
  NodeHead head;
  parser.Advance();
  head.reflected = def.m_strict && (def.m_reflected || def.IsMixin());
  if (parser.Accept(kMinus)) head.reflected = false;
  head.hard = parser.Accept(kXor);
  return head;
}

}  // namespace qrex
