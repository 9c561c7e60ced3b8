#include "macro/expand.h"

#include <cstring>

#include "lex/literals.h"
#include "lex/sections.h"
#include "macro/directives.h"
#include "macro/expansion_context.h"
#include "text/numbers.h"

namespace qrex {

namespace {

constexpr size_t kLargeText = 1u << 20;

// The one that is written to, until the expansion ends.
struct OpenSink : ExpansionSink {
  explicit OpenSink(MacroWorld& world) : world(world), outer(world.sink) {
    if (outer) bytesOutside = outer->bytesOutside + outer->Bytes();
    world.sink = this;
  }
  ~OpenSink() { world.sink = outer; }
  OpenSink(const OpenSink&) = delete;
  OpenSink& operator=(const OpenSink&) = delete;

  MacroWorld& world;
  ExpansionSink* const outer;
};

}  // namespace

bool ImportHandler::ImportPath(const std::string&, const char*) { return false; }
std::string ImportHandler::ImportHint(const std::string&) const { return {}; }
std::string ImportHandler::PlaceOf(const char*) const { return {}; }

std::string WithToken(std::string_view message, const LexToken& token) { return std::string(message) + Printed(token); }

void ForgetPosition(LexScannerException& exception, const std::string& text) {
  if (TextRange(std::string_view(text)).Contains(exception.position)) exception.position = nullptr;
}

ExpansionContext::ExpansionContext(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent,
                                   LineIndent outIndent, ExpansionSink& sink, const TextRange* anchor,
                                   std::shared_ptr<const BodyWords> words)
    : m_handler(handler),
      m_frame(frame),
      m_world(frame.World()),
      m_sink(sink),
      m_stripIndent(stripIndent),
      m_outIndent(outIndent),
      m_text(text),
      m_anchor(anchor),
      m_words(std::move(words)),
      m_hasLineFeeds(!m_words && !outIndent.IsNone() && text.View().find('\n') != std::string_view::npos),
      m_scanner(text, frame.FileFrame() ? frame.FileFrame()->dialect : Dialect::Qrex),
      m_tokenText(text.begin, text.begin),
      m_pendingBegin(text.begin),
      m_settled(text.begin) {
  CheckPart(text);
  ++m_world.nesting;
}

ExpansionContext::~ExpansionContext() { --m_world.nesting; }

void ExpansionContext::Run() {
  RunToEnd();
  FlushTo(m_scanner.begin);
}

bool ExpansionContext::RunUnlessPlain() {
  RunToEnd();
  if (m_pendingBegin == m_text.begin && m_outIndent.IsNone() && m_sink.output.empty()) {
    m_sink.map.AddVerbatim(m_text.begin, m_text.end);
    return false;
  }
  FlushTo(m_scanner.begin);
  return true;
}

void ExpansionContext::RunToEnd() {
  LexToken token;
  while (ReadPastPlain(token)) {
    m_isPlain = false;
    switch (token.kind) {
      case kIdentifier:
        ExpandIdentifier(token);
        break;
      case kDoubleQuoted:
        SubstituteInString(token);
        break;
      case kRawString:
        CopyRawString(token);
        break;
      case kMacroComment:
        m_tokenText = token.text;
        Settle();
        SwallowLine();
        break;
      case kAt:
        m_tokenText = token.text;
        ExpandAt();
        break;
      default:
        break;
    }
  }
}

// To the next token that is not plain; false: there is none.
template <Dialect dialect>
bool ExpansionContext::ReadPastPlainIn(LexToken& found) {
  LexScanner ahead = m_scanner;  // a copy, and the token too: they stay in registers
  LexToken token;
  const NamesInUse& names = m_world.names;
  const bool strips = m_stripIndent > 0;
  do {
    m_settled = ahead.begin;
    if (strips && !ahead.AtEnd() && IsBlankByte(*ahead.begin)) {
      m_scanner = ahead;
      SkipToToken();
      ahead = m_scanner;
    }
    ReadTokenOf<dialect>(ahead, token, true);
  } while (IsPlainToken(token, names));
  m_here = token.text.begin;
  for (const char* at = m_here; at > m_settled; --at) {
    if (at[-1] == '\n') m_settled = at;
  }
  m_scanner = ahead;
  found = token;
  return token.kind != kEndOfText;
}

bool ExpansionContext::ReadToWord(LexToken& found) {
  const std::vector<BodyWords::Word>& words = m_words->words;
  const size_t from = static_cast<size_t>(m_scanner.begin - m_text.begin);
  while (m_nextWord < words.size() && words[m_nextWord].begin < from) ++m_nextWord;  // read as an argument
  if (m_nextWord == words.size()) {
    m_scanner.begin = m_settled = m_here = m_text.end;
    return false;
  }
  const BodyWords::Word& word = words[m_nextWord++];
  m_settled = m_here = m_text.begin + word.begin;
  m_scanner.begin = m_here + word.size;
  found = {word.kind, {m_here, m_scanner.begin}};
  return true;
}

bool ExpansionContext::ReadPastPlain(LexToken& found) {
  if (m_words && m_words->asOf == m_world.names.Changes()) return ReadToWord(found);
  return m_scanner.dialect == Dialect::Cpp ? ReadPastPlainIn<Dialect::Cpp>(found)
                                           : ReadPastPlainIn<Dialect::Qrex>(found);
}

// To the begin of the next token. Every line but the first loses up to `m_stripIndent` columns.
void ExpansionContext::SkipToToken() {
  for (; !m_scanner.AtEnd(); ++m_scanner.begin) {
    if (*m_scanner.begin == ' ' || *m_scanner.begin == '\t') continue;
    if (*m_scanner.begin != '\n') break;
    m_isPlain = false;
    m_settled = ++m_scanner.begin;
    Settle();
    StripIndentation(m_stripIndent);
    DropToScanner();
    --m_scanner.begin;
  }
}

void ExpansionContext::ExpandIdentifier(const LexToken& token) {
  m_tokenText = token.text;
  LSVariable* variable = m_frame.Find(token.text.View(), token.text.begin);
  if (!variable) return;
  FlushTo(m_here);
  if (m_sink.NotesCalls()) return CallAndNote(*variable);
  CallVariable(*variable);
}

void ExpansionContext::SubstituteInString(const LexToken& token) {
  const LSFileFrame* fileFrame = m_frame.FileFrame();
  if (!fileFrame) return;
  m_tokenText = token.text;
  std::string text = token.text.Text();
  try {
    if (!fileFrame->Substitute(text)) return;
  } catch (LexScannerException& exception) {
    exception.position = token.text.begin;
    throw;
  }
  FlushTo(m_here);
  EmitGenerated(text);
  DropToScanner();
}

// The lines of a raw string are its value, so they are not indented with those around them.
void ExpansionContext::CopyRawString(const LexToken& token) {
  if (m_outIndent.IsNone()) return;
  const void* lineFeed = std::memchr(token.text.begin, '\n', token.text.Size());
  if (!lineFeed) return;
  FlushTo(static_cast<const char*>(lineFeed));
  CopySource({m_pendingBegin, token.text.end}, 0, m_anchor);
  DropToScanner();
}

void ExpansionContext::ExpandAt() {
  const LexToken token = Next();
  switch (token.kind) {
    case kAt:
      FlushTo(m_here);
      return DropToScanner();
    case kOpenBracket:
      FlushTo(m_here);
      return DoubleExpansion();
    case kOpenParen:
      FlushTo(m_here);
      return ParenExpression();
    case kDollar:
      if (m_handler) DefineSubstitution();
      return;
    case kIdentifier:
      break;
    default:
      return;
  }
  const Directive* directive = FindDirective(token.text.View());
  if (!directive) {
    ExpandPredefined(token);
    return;
  }
  if (directive->line == Directive::Line::Kept) {
    FlushTo(m_here);
  } else if (directive->line != Directive::Line::OfItsOwn) {
    Settle();
    DropTo(m_here);
  }
  directive->Run(*this);
  if (directive->line == Directive::Line::DroppedWhole) SwallowLine();
}

bool ExpansionContext::ExpandPredefined(const LexToken& name) {
  thread_local std::string key;
  key.assign("@").append(name.text.View());
  const LSVariable* variable = m_frame.FindInChain(key);
  if (!variable) return false;
  FlushTo(m_here);
  EmitGenerated(variable->ValueText());
  DropToScanner();
  return true;
}

// --- Output

void ExpansionContext::FlushTo(const char* position) {
  if (m_pendingBegin < position) {
    const bool mayBeginLine = m_hasLineFeeds || m_sink.AtLineStart();
    CopySource({m_pendingBegin, position}, mayBeginLine ? m_outIndent : LineIndent(), m_anchor);
  }
  m_pendingBegin = position;
}

void ExpansionContext::CopySource(const TextRange& text, LineIndent indent, const TextRange* anchor) {
  if (anchor) {
    m_sink.WriteGenerated(text.View(), anchor->begin, indent);
  } else {
    m_sink.WriteVerbatim(text, indent);
  }
}

void ExpansionContext::DropTo(const char* position) { m_pendingBegin = position; }

void ExpansionContext::EmitGenerated(std::string_view text, LineIndent column) {
  CheckLength(text.size());
  m_sink.WriteGenerated(text, AnchorForTemporary()->begin, column);
}

void ExpansionContext::StripIndentation(int64_t width) {
  for (int64_t column = 0; column < width && !m_scanner.AtEnd(); ++m_scanner.begin) {
    if (*m_scanner.begin == ' ')
      ++column;
    else if (*m_scanner.begin == '\t')
      column += kTabWidth;
    else
      return;
  }
}

void ExpansionContext::SwallowLine() {
  const char* behindLine = nullptr;
  for (; !m_scanner.AtEnd(); ++m_scanner.begin) {
    const char c = *m_scanner.begin;
    if (c == '\n')
      behindLine = m_scanner.begin + 1;
    else if (c != ' ' && c != '\t')
      break;
  }
  if (behindLine) m_scanner.begin = behindLine;
  StripIndentation(m_stripIndent);
  DropToScanner();
}

// --- Expansion of parts

void ExpansionContext::ExpandBlock(const TextRange& block, LSFrame& frame, int indent, LineIndent column) {
  if (block.Empty()) return;
  ExpansionContext(nullptr, frame, block, indent, column, m_sink, m_anchor).Run();
}

std::string ExpansionContext::ExpandPart(const TextRange& part, int64_t stripIndent) {
  LSFrame child(&m_frame);
  return ExpandAside(child, part, stripIndent, m_anchor);
}

std::string ExpandAside(LSFrame& frame, const TextRange& text, int64_t stripIndent, const TextRange* anchor) {
  if (text.Empty()) return {};
  OpenSink sink(frame.World());
  ExpansionContext(nullptr, frame, text, stripIndent, 0, sink, anchor).Run();
  return std::move(sink.output);
}

static std::string ExpandExpressionAside(LSFrame& frame, const TextRange& text, const TextRange* anchor) {
  if (text.Empty()) return {};
  OpenSink sink(frame.World());
  ExpansionContext context(nullptr, frame, text, 0, 0, sink, anchor);
  context.ReadAsExpression();
  context.Run();
  return std::move(sink.output);
}

std::string ExpansionContext::ExpandExpression(const TextRange& part) {
  LSFrame child(&m_frame);
  return ExpandExpressionAside(child, part, m_anchor);
}

TextRange ExpansionContext::ReadExpressionText(bool openAlreadyRead) {
  LexScanner expression(m_scanner, Dialect::Qrex);
  const TextRange text = ReadParenSection(expression, openAlreadyRead);
  m_scanner.begin = expression.begin;
  return text;
}

LexToken ExpansionContext::RequireIdentifier(std::string_view message) {
  const LexToken token = Next();
  if (token.kind != kIdentifier) FailAt(token, WithToken(message, token));
  return token;
}

void ExpansionContext::FailAt(const LexToken& token, std::string message) const {
  throw LexScannerException(std::move(message), token);
}

// --- Entries

void Expand(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent, int64_t outIndent,
            ExpansionSink& sink) {
  ExpansionContext(handler, frame, text, stripIndent, outIndent, sink, nullptr).Run();
}

std::string ExpandToString(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent,
                           int64_t outIndent) {
  SourceMap map;
  return ExpandToStringWithMap(handler, frame, text, stripIndent, outIndent, map);
}

std::string ExpandToStringWithMap(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent,
                                  int64_t outIndent, SourceMap& map) {
  std::string result;
  const TextRange expanded = ExpandWithMap(handler, frame, text, stripIndent, outIndent, result, map);
  return result.empty() ? expanded.Text() : result;
}

TextRange ExpandWithMap(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent,
                        int64_t outIndent, std::string& storage, SourceMap& map) {
  // A file counts afresh: a chain of imports may be longer than the nesting of macros.
  struct Restore {
    int& nesting;
    const int value = nesting;
    ~Restore() { nesting = value; }
  } restore{frame.World().nesting};
  if (handler) restore.nesting = 0;
  OpenSink sink(frame.World());
  sink.map.calls = std::move(map.calls);
  sink.expectedSize = text.Size() + text.Size() / (text.Size() < kLargeText ? 4 : 1);
  const bool changed = ExpansionContext(handler, frame, text, stripIndent, outIndent, sink, nullptr).RunUnlessPlain();
  map = std::move(sink.map);
  storage = std::move(sink.output);
  return changed ? TextRange(std::string_view(storage)) : text;
}

namespace {

std::string ReadCanonical(ExpressionParser& parser, VarType type) {
  switch (type) {
    case VarType::Bool:
      return parser.ReadBool() ? "true" : "false";
    case VarType::Int:
      return std::to_string(parser.ReadInt32());
    case VarType::Double:
      return ToString(parser.ReadFloat64());
    case VarType::Char: {
      std::string text;
      WriteCharLiteral(text, static_cast<char>(parser.ReadChar()));
      return text;
    }
    default:
      return parser.ReadStringValue();
  }
}

}  // namespace

std::string EvaluateAsText(LSFrame& frame, const TextRange& text, VarType type) {
  return EvaluateAsText(frame, text, type, nullptr);
}

std::string EvaluateAsText(LSFrame& frame, const TextRange& text, VarType type, const TextRange* anchor) {
  LSFrame child(&frame);
  const std::string expansion = ExpandExpressionAside(child, text, anchor);
  try {
    ExpressionParser parser;
    parser.SetInput(TextRange(std::string_view(expansion)));
    std::string value = ReadCanonical(parser, type);
    if (parser.current.kind != kEndOfText) {
      throw LexScannerException("Read " + Printed(parser.current) + " in middle of expression", parser.current);
    }
    return value;
  } catch (LexScannerException& exception) {
    ForgetPosition(exception, expansion);
    throw;
  }
}

}  // namespace qrex
