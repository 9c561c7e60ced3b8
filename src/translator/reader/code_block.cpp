#include "translator/reader/code_block.h"

#include <utility>

#include "translator/declared/class_def.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

// At the `$`; true when the word behind it was dealt with.
bool ReplaceItem(QrexParser& parser, ClassDef& def) {
  LexScanner ahead = parser.scanner;
  const LexToken word = NextToken(ahead);
  for (const ClassKeyword& keyword : parser.Keywords().classLevel) {
    if (keyword.scope != Scope::BodyAndCode || !word.Is(keyword.word)) continue;
    parser.CopyToCurrent();
    parser.Advance();
    keyword.parse(parser, def);
    if (keyword.endsOn == EndsOn::LastToken) parser.Advance();
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
  const bool wasInCodeBlock = std::exchange(parser.inCodeBlock, true);
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
  parser.inCodeBlock = wasInCodeBlock;
  parser.Advance();
  parser.CopyToCurrent();
  parser.out << "\n";
  parser.Flush();
}

// A mark is ahead of the first word of each line.
std::string MarkedText(const QrexParser& parser, const char* begin, const char* end) {
  if (!parser.file.HasLineDirectives()) return std::string(begin, end);
  std::string text;
  for (bool atLineStart = true; begin < end; ++begin) {
    const bool isBlank = *begin == ' ' || (*begin >= 9 && *begin <= 13);
    if (atLineStart && !isBlank) {
      text += parser.stream.MarkOf(begin);
      atLineStart = false;
    }
    if (*begin == '\n') atLineStart = true;
    text += *begin;
  }
  return text;
}

namespace {

// Text of a class body that does not stay where it is written, with what `$` means in it.
class CodeText {
 public:
  CodeText(QrexParser& parser, const ClassDef& def, const char* begin) : m_parser(parser), m_def(def), m_from(begin) {}

  // Passes the current token; true when it was a `$` item.
  bool TakeItem() {
    if (m_parser.Is(kDollarDollar)) {
      Take(m_parser.current.text.begin, m_parser.current.text.end);
      m_text += m_def.name;
      m_parser.Advance();
      return true;
    }
    LexScanner ahead = m_parser.scanner;
    if (!m_parser.Is(kDollar)) return false;
    const LexToken word = NextToken(ahead);
    if (!word.Is("this") && !word.Is("new")) return false;
    Take(m_parser.current.text.begin, word.text.end);
    m_parser.Advance();
    if (word.Is("this")) {
      m_text += kDollarThis;
      m_parser.Advance();
      return true;
    }
    m_text += kDollarNew;
    SkipNewExpression(m_parser);
    Take(m_parser.current.text.begin, m_parser.current.text.begin);
    m_text += ")";
    return true;
  }

  std::string TextTo(const char* end) {
    Take(end, end);
    std::string text = Trimmed(m_text.data(), m_text.data() + m_text.size());
    if (!text.empty()) text += m_parser.EndMark();
    return text;
  }

 private:
  void Take(const char* end, const char* next) {
    if (m_from < end) m_text += MarkedText(m_parser, m_from, end);
    m_from = next;
  }

  QrexParser& m_parser;
  const ClassDef& m_def;
  const char* m_from;
  std::string m_text;
};

}  // namespace

std::string ReadBraceContent(QrexParser& parser, const ClassDef& def) {
  CodeText code(parser, def, parser.current.text.end);
  parser.Expect(kOpenBrace, "{");
  for (int64_t depth = 1;;) {
    if (parser.Is(kEndOfText)) parser.Fail("Met EOS before read matching brace");
    if (code.TakeItem()) continue;
    if (parser.Is(kOpenBrace)) ++depth;
    if (parser.Is(kCloseBrace) && --depth == 0) return code.TextTo(parser.current.text.begin);
    parser.Advance();
  }
}

std::string ReadShortBody(QrexParser& parser, const ClassDef& def, const std::string& name) {
  if (parser.Is(kOpenBrace)) {
    std::string body = ReadBraceContent(parser, def);
    parser.Advance();
    if (!parser.Is(kSemicolon)) parser.FailExpected(";");
    return body;
  }
  CodeText code(parser, def, parser.current.text.begin);
  const char* end = parser.current.text.begin;  // of the last token: a comment behind it stays out
  while (!parser.Is(kSemicolon)) {
    if (parser.Is(kEndOfText)) parser.Fail("Met EOS while scanning forwards for semicolon");
    if (!code.TakeItem()) parser.Advance();
    end = parser.previous.text.end;
  }
  return name + " = " + code.TextTo(end) + (parser.WantsCompilableText() ? ";" : "");
}

std::string_view PassingSuffix(TypeView type) {
  type = type.WithoutMetadata();
  return type.IsScalar() || type.Op() == kOpPointer ? "" : " const&";
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
