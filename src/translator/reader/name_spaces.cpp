// The word `namespace`. In C++ of today only a definition is acted on: an alias, a macro's argument or the text of a #
// line is plain text. Else the word opens a name space of one name or none, wherever it is.
#include <algorithm>

#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

// Of the words ahead of a brace one is the name, the others are macros, which mostly are in capitals.
const LexToken& NameAmong(const std::vector<LexToken>& words) {
  const auto isLower = [](char c) { return c >= 'a' && c <= 'z'; };
  const auto name = std::find_if(words.begin(), words.end(), [&](const LexToken& word) {
    return std::any_of(word.text.begin, word.text.end, isLower);
  });
  return name == words.end() ? words.front() : *name;
}

}  // namespace

// On a line that begins with #, or that is the continuation of one. Asked in the order of the text: what was walked for
// one answer is not walked again.
bool QrexParser::StandsInDirective(const char* position) {
  const char* at = position;
  while (at > m_lineAsked && (at[-1] != '\n' || (at - 1 > expanded.begin && at[-2] == '\\'))) --at;
  if (at > m_lineAsked || at == expanded.begin) {
    while (at < position && (*at == ' ' || *at == '\t')) ++at;
    m_lineIsDirective = *at == '#';
  }
  m_lineAsked = position;
  return m_lineIsDirective;
}

// Behind `namespace`: "a::b::inline c", and attributes and macros anywhere, up to the `{`, which is current afterwards.
// Nothing when it is no definition; where the reading ends is of no meaning then. The next `namespace` ends it, so that
// no text is read for more than one of them.
std::optional<QrexParser::NameSpaceHead> QrexParser::ReadNameSpaceHead() {
  NameSpaceHead head;
  std::vector<LexToken> words, calls;  // of one level: those without arguments, those with
  const auto endLevel = [&] {
    if (!words.empty()) {
      head.names.push_back(NameAmong(words));
    } else if (!calls.empty()) {
      head.names.push_back(calls.front());
    }
    words.clear();
    calls.clear();
  };
  for (; !Is(kOpenBrace); Advance()) {
    if (Is(kColonColon)) {
      const size_t before = head.names.size();
      endLevel();
      if (head.names.size() == before) return std::nullopt;
    } else if (Is(kIdentifier)) {
      if (Is("namespace")) return std::nullopt;
      if (!Is("inline")) words.push_back(current);
    } else if (Is(kOpenParen) && !words.empty()) {
      calls.push_back(words.back());
      words.pop_back();
      if (!SkipBrackets(kOpenParen, kCloseParen)) return std::nullopt;
    } else if (!Is(kOpenBracket) || !SkipBrackets(kOpenBracket, kCloseBracket)) {
      return std::nullopt;
    }
  }
  const bool endsInColons = previous.kind == kColonColon;
  endLevel();
  if (endsInColons) return std::nullopt;
  head.brace = current;
  return head;
}

// From an opening bracket to the one that closes it. False when the text ends before, or the next `namespace` begins.
bool QrexParser::SkipBrackets(int32_t open, int32_t close) {
  for (int64_t depth = 0; !Is(kEndOfText) && !(Is(kIdentifier) && Is("namespace")); Advance()) {
    if (Is(open)) ++depth;
    if (Is(close) && --depth == 0) return true;
  }
  return false;
}

void QrexParser::EnterNameSpace(const std::string& name, const char* position) {
  CheckNesting(m_nameSpaces.size() - 1);
  NameSpace* opened = Current().FindOrCreateNameSpace(name);
  if (!opened) {
    Fail("Can't open namespace " + name + " : " + PrintedElement(*Current().LookupLocal(name)) + " is not a namespace");
  }
  if (!opened->position) opened->position = stream.SourcePosition(position);
  m_nameSpaces.push_back(opened);
}

void QrexParser::OpenNameSpace() {
  if (scanner.dialect == Dialect::Cpp) return OpenCppNameSpace();
  Advance();
  const OuterDepth outer{m_braceDepth, m_nameSpaces.size()};
  const char* const position = current.text.begin;
  std::string name;
  if (Is(kIdentifier)) {
    name = ReadIdentifier();
  } else if (!Is(kOpenBrace)) {
    FailExpected("identifier");
  }
  EnterNameSpace(name, position);
  Expect(kOpenBrace, "{");
  m_savedDepths.push_back(outer);
  m_braceDepth = 1;
}

void QrexParser::OpenCppNameSpace() {
  const bool isInline = previous.Is("inline");
  const LexToken word = current;
  Advance();
  if (StandsInDirective(word.text.begin)) return;
  const ParserBase behindWord = *this;
  const std::optional<NameSpaceHead> head = ReadNameSpaceHead();
  static_cast<ParserBase&>(*this) = behindWord;
  if (!head) {
    // A macro may take the word as an argument, and a branch of an #if may hold what is behind it.
    const bool mayBeCpp = Is(kIdentifier) || Is(kOpenBracket) || Is(kComma) || Is(kCloseParen) || Is(kHash);
    if (!mayBeCpp) FailExpected("identifier");
    return;
  }
  const OuterDepth outer{m_braceDepth, m_nameSpaces.size()};
  if (head->names.empty()) EnterNameSpace({}, current.text.begin);
  for (const LexToken& name : head->names) {
    while (current.text.begin != name.text.begin) Advance();
    const bool isNameInline = previous.Is("inline");
    Advance();
    EnterNameSpace(name.text.Text(), name.text.begin);
    Current().sharesBrace = &name != &head->names.front();
    if (isNameInline) Current().isInline = true;
  }
  if (isInline) m_nameSpaces[outer.nameSpaces]->isInline = true;
  while (current.text.begin != head->brace.text.begin) Advance();
  Advance();
  m_savedDepths.push_back(outer);
  m_braceDepth = 1;
}

void QrexParser::CloseBrace() {
  if (m_braceDepth < 1) {
    if (scanner.dialect == Dialect::Qrex) Fail("Can't match }");
    Advance();  // branches of an #if may close the same brace
    return;
  }
  Advance();
  if (--m_braceDepth == 0 && !m_savedDepths.empty()) {
    m_braceDepth = m_savedDepths.back().braces;
    m_nameSpaces.resize(m_savedDepths.back().nameSpaces);
    m_savedDepths.pop_back();
  }
}

}  // namespace qrex
