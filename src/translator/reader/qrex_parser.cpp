#include "translator/reader/qrex_parser.h"

#include <algorithm>
#include <cstring>

#include "lex/cpp_literals.h"
#include "lex/sections.h"
#include "platform/system.h"
#include "text/paths.h"
#include "translator/reader/cpp_words.h"
#include "translator/reader/kept_output.h"
#include "translator/reader/line_directives.h"
#include "translator/types/type_code.h"

namespace qrex {

QrexParserOutputStream::QrexParserOutputStream(IOutputStream& target, std::vector<const char*>& lineTable,
                                               TextRange expanded, const SourceMap& map)
    : m_target(target), m_lineTable(lineTable), m_expanded(expanded), m_map(map), m_cursor(map) {}

void QrexParserOutputStream::AddLines(std::string_view text) {
  size_t lineFeed = text.find('\n');
  if (lineFeed == std::string_view::npos) return;
  const char* const position = SourcePosition();
  for (; lineFeed != std::string_view::npos; lineFeed = text.find('\n', lineFeed + 1)) m_lineTable.push_back(position);
}

void QrexParserOutputStream::Write(const void* data, size_t length) {
  if (m_directives) return m_directives->WriteGenerated({static_cast<const char*>(data), length});
  AddLines({static_cast<const char*>(data), length});
  m_target.Write(data, length);
}

void QrexParserOutputStream::WriteIndented(std::string_view text, size_t blanks, bool atLineStart) {
  if (m_directives) return IOutputStream::WriteIndented(text, blanks, atLineStart);
  AddLines(text);
  m_target.WriteIndented(text, blanks, atLineStart);
}

void QrexParserOutputStream::Flush() { m_target.Flush(); }

void QrexParserOutputStream::CopyRange(const char* begin, const char* end) {
  if (m_directives) {
    m_copied = end;
    return m_directives->WriteCopied(begin, end);
  }
  if (m_kept) m_kept->WillCopy({begin, end});
  m_target.Write(begin, static_cast<size_t>(end - begin));
  while (const void* newline = std::memchr(begin, '\n', static_cast<size_t>(end - begin))) {
    m_copied = static_cast<const char*>(newline);
    m_lineTable.push_back(SourcePosition());
    begin = m_copied + 1;
  }
  m_copied = end;
}

const char* QrexParserOutputStream::SourcePosition() {
  if (!m_copied || m_expanded.Empty()) return nullptr;
  const char* last = m_expanded.end - 1;
  return m_cursor.Map((m_copied < last ? m_copied : last) - m_expanded.begin);
}

const char* QrexParserOutputStream::SourcePosition(const char* expanded) const {
  if (m_expanded.Empty()) return nullptr;
  const char* last = m_expanded.end - 1;
  return MapOutputOffset(m_map, (expanded < last ? expanded : last) - m_expanded.begin);
}

std::string QrexParserOutputStream::MarkOf(const char* expanded) {
  return m_directives ? PositionMark(m_directives->SourceOf(expanded)) : std::string();
}

QrexParser::QrexParser(ScannedFile& file, QrexParserOutputStream& stream, TextWriter& out, TextRange expanded,
                       const KeywordTables& keywords)
    : file(file),
      stream(stream),
      out(out),
      expanded(expanded),
      m_keywords(keywords),
      m_copyPosition(expanded.begin),
      m_nameSpaces{file.rootNameSpace.get()},
      m_lineAsked(expanded.begin) {
  SetInput(expanded, file.frame.dialect);
}

void QrexParser::CopyTo(const char* position) {
  out.Flush();
  if (position < m_copyPosition) return;  // dealt with before
  for (const TextRange& range : m_uncopied) {
    if (range.begin < m_copyPosition || range.end > position) continue;
    stream.CopyRange(m_copyPosition, range.begin);
    m_copyPosition = range.end;
  }
  std::erase_if(m_uncopied, [&](const TextRange& range) { return range.end <= position; });
  stream.CopyRange(m_copyPosition, position);
  m_copyPosition = position;
}

// Plain text is not copied token by token: it goes out in one run when something other is met.
void QrexParser::Translate() {
  const FileKind kind = file.file.kind;
  const bool checksIncludes = kind == FileKind::C || kind == FileKind::Cpp || kind == FileKind::H;
  // Braces within others are counted in passing.
  const auto isActedOn = [this, checksIncludes](const LexToken& token) {
    switch (token.kind) {
      case kIdentifier:
        return (*token.text.begin == 'u' && token.Is("using")) || (*token.text.begin == 'n' && token.Is("namespace"));
      case kHash:
        return checksIncludes;
      case kOpenBrace:
        ++m_braceDepth;
        return false;
      case kCloseBrace:
        if (m_braceDepth < 2) return true;
        --m_braceDepth;
        return false;
      case kAt:
      case kDollar:
      case kEndOfText:
        return true;
      default:
        return false;
    }
  };
  while (current.kind != kEndOfText) {
    if (checksIncludes && Is(kHash)) {
      CheckInclude();
      continue;
    }
    if (Is(kAt) && TranslateAt()) continue;
    if (Is(kIdentifier) && Is("using")) {
      Advance();
      AcceptWord("namespace");
    } else if (Is(kIdentifier) && Is("namespace")) {
      OpenNameSpace();
    } else if (Is(kOpenBrace)) {
      ++m_braceDepth;
      Advance();
    } else if (Is(kCloseBrace)) {
      CloseBrace();
    } else if (Is(kDollar)) {
      CopyToCurrent();
      Advance();
      Dispatch();
    } else {
      AdvanceUntil(isActedOn);
    }
  }
  CopyTo(expanded.end);
  if (warnings.HasSaved()) ReportWarning(Warning::PushWithoutPop, "$warning(push) without matching pop");
}

void QrexParser::CheckInclude() {
  Advance();
  if (!AcceptWord("include") || !Is(kDoubleQuoted)) return;
  std::string path;
  DecodeString(current, scanner.dialect, path);
  const ProjectFile* included = file.ResolveImport(path);
  if (included && included->project->usesQrex) Fail("#include should be replaced by @import");
}

// False for a word other than `import`, which is then the current token.
bool QrexParser::TranslateAt() {
  CopyToCurrent();
  Advance();
  if (!AcceptWord("import")) return false;
  DropToCurrent();
  out << "#include ";
  if (!Is(kDoubleQuoted)) FailExpected("quoted string");
  std::string path;
  DecodeString(current, scanner.dialect, path);
  ProjectFile* target = file.ResolveImport(path);
  if (!target) Fail("Can't import file: " + path);
  const ScannedFile& imported = file.host.GetScannedFile(*target);
  file.mounted.Add(imported.index);
  file.mounted.Add(imported.mounted);
  Advance();
  return true;
}

void QrexParser::Dispatch() {
  for (const Keyword& keyword : m_keywords.fileLevel) {
    if (!Is(keyword.word)) continue;
    try {
      keyword.parse(*this);
    } catch (LexScannerException& exception) {
      if (scanner.dialect == Dialect::Cpp) AdviseOnCppWord(expanded, exception);
      throw;
    }
    if (keyword.endsOn == EndsOn::LastToken) Advance();
    return;
  }
  LexScannerException failure("'$" + Printed(current) + "' is not a valid directive", current);
  if (Is(kOpenBracket)) failure.WithHint("an attribute stands ahead of the $, where it is plain text");
  throw failure;
}

bool QrexParser::Accept(int32_t kind) {
  if (!Is(kind)) return false;
  Advance();
  return true;
}

bool QrexParser::AcceptWord(std::string_view word) {
  if (!Is(kIdentifier) || !Is(word)) return false;
  Advance();
  return true;
}

std::string QrexParser::RequireIdentifier(std::string_view what) {
  if (!Is(kIdentifier)) FailExpected(what);
  return ReadIdentifier();
}

void QrexParser::Fail(std::string message) const { throw LexScannerException(std::move(message), current); }

void QrexParser::CheckNesting(size_t levels) const {
  constexpr size_t kMaxNesting = 1000;
  if (levels >= kMaxNesting || platform::IsStackShort()) Fail("Declarations nested too deeply");
}

void QrexParser::SkipToMatching(int32_t open, int32_t close, std::string_view atEnd) {
  for (int64_t depth = 0;; Advance()) {
    if (Is(kEndOfText)) Fail(std::string(atEnd));
    if (Is(open)) ++depth;
    if (Is(close) && --depth == 0) return;
  }
}

void QrexParser::SplitShiftRight() {
  if (!Is(kShiftRight)) return;
  current.kind = kGreater;
  current.text.end = current.text.begin + 1;
  scanner.begin = current.text.end;
}

void QrexParser::SkipAngles(std::string_view atEnd) {
  for (int64_t depth = 0;; Advance()) {
    if (Is(kEndOfText)) Fail(std::string(atEnd));
    SplitShiftRight();
    if (Is(kLess)) ++depth;
    if (Is(kGreater) && --depth == 0) return;
  }
}

// --- $new, $init, $uninit

void SkipNewExpression(QrexParser& parser) {
  parser.Advance();
  do {
    parser.RequireIdentifier();
    while (parser.Is(kOpenParen) || parser.Is(kLess)) {
      if (parser.Is(kLess)) {
        parser.SkipAngles();
      } else {
        parser.SkipToMatching(kOpenParen, kCloseParen, "Reached end of stream while scanning for matching )");
      }
      parser.Advance();
    }
  } while (parser.Accept(kColonColon));
}

void ParseNew(QrexParser& parser) {
  parser.DropBehindCurrent();
  parser.out << kDollarNew;
  SkipNewExpression(parser);
  parser.CopyToCurrent();
  parser.out << ")";
  parser.Flush();
}

namespace {

void ParseInitBlock(QrexParser& parser, std::string_view keyword, std::vector<std::string>& names) {
  parser.Advance();
  parser.DropToCurrent();
  if (!parser.Is(kOpenBrace)) parser.FailExpected("{");
  const std::string name = parser.file.file.stem + std::to_string(names.size());
  std::string qualified;
  for (NameSpace* scope = &parser.Current(); !scope->IsRoot(); scope = scope->parent) {
    qualified = scope->name + "::" + qualified;
  }
  names.push_back(qualified + name);
  parser.out << "void _" << keyword << "_" << name << "()\n";
  parser.Flush();
}

}  // namespace

void ParseInit(QrexParser& parser) { ParseInitBlock(parser, "Register", parser.file.registrations.registerNames); }
void ParseUninit(QrexParser& parser) {
  ParseInitBlock(parser, "Unregister", parser.file.registrations.unregisterNames);
}

}  // namespace qrex
