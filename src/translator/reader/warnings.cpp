// The QrexParser operations that tell of warnings, and $warning.

#include <unordered_set>

#include "text/numbers.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

void WritePosition(TextWriter& out, const ScannedFile& file, const char* position) {
  std::string path;
  int64_t line;
  if (position && file.host.FindSourcePosition(position, path, line)) out << path << "(" << line << ") : ";
}

}  // namespace

void QrexParser::SeeDeclaration(const NameSpaceElement& element) {
  TraceWriter trace;
  WritePosition(trace, file, element.position);
  trace << "see declaration of ";
  PrintElement(trace, element);
  trace << "\n";
}

void QrexParser::ReportWarning(int code, std::string_view text, const NameSpaceElement* element, const char* address) {
  if (!WarningOn(code)) return;
  const char* position = address   ? stream.SourcePosition(address)
                         : element ? element->position
                                   : stream.SourcePosition(scanner.begin);
  {
    TraceWriter trace;
    WritePosition(trace, file, position);
    trace << "warning W" << code << " : " << text << "\n";
  }
  file.host.CountWarning();
}

void QrexParser::WarnOfText(std::string_view text, const NameSpaceElement& element, const char* address) {
  if (WantsCompilableText()) ReportWarning(Warnings::kCannotCompile, text, &element, address);
}

void QrexParser::CheckPublicHeader(const NameSpaceElement& element) {
  CheckNotExported(element);
  CheckNotInPublicHeader(element);
}

void QrexParser::CheckNotExported(const NameSpaceElement& element) {
  if (file.file.isPublicHeader && !element.m_exported) {
    ReportWarning(1009, PrintedElement(element) + " not exported in public header of library", &element);
  }
}

void QrexParser::CheckNotInPublicHeader(const NameSpaceElement& element) {
  if (!file.file.isPublicHeader && element.m_exported && IsLibrary(GetProject().targetType)) {
    ReportWarning(1008, PrintedElement(element) + " doesn't appear in public header of library");
  }
}

void QrexParser::CheckMetadata(const NameSpaceElement& element) {
  if (!element.m_reflected && element.ContainsMetaData()) {
    ReportWarning(1001, "Non-reflected " + PrintedElement(element) + " contains metadata", &element);
  }
}

void QrexParser::CheckRedundant(const NameSpaceElement& element) {
  if (element.m_reflected) return;
  ReportWarning(1004, PrintedElement(element) + " is not reflected and has redundant << >> directives", &element);
}

void QrexParser::CheckReferences(const NameSpaceElement& element) {
  if (!element.m_reflected || !element.m_strict || !WarningOn(1002)) return;
  std::vector<const NameSpaceElement*> references;
  element.CollectReferences(references);
  std::unordered_set<const NameSpaceElement*> seen;
  for (const NameSpaceElement* other : references) {
    if (other->GetDeclStatus() == DeclStatus::Forward || other->EffectivelyRegistered()) continue;
    if (!seen.insert(other).second) continue;
    ReportWarning(1002, "Reflected " + PrintedElement(element) + " references non-registered " + PrintedElement(*other),
                  &element);
    SeeDeclaration(*other);
  }
}

void ParseWarning(QrexParser& parser) {
  parser.Advance();
  if (!parser.Is(kOpenParen)) parser.FailExpected("(");
  parser.Advance();
  while (!parser.Is(kCloseParen)) {
    if (parser.AcceptWord("push")) {
      parser.warnings.Push();
    } else if (parser.AcceptWord("pop")) {
      if (!parser.warnings.HasSaved()) parser.Fail("$warning pop without matching push");
      parser.warnings.Pop();
    } else if (parser.Is("enable") || parser.Is("disable")) {
      const bool on = parser.Is("enable");
      parser.Advance();
      parser.Expect(kColon, ":");
      do {
        const int64_t code = parser.ReadInt64();
        if (!Warnings::IsCode(code, parser.WantsCompilableText()))
          parser.Fail("Invalid warning code : " + ToString(code));
        parser.warnings.Set(static_cast<int>(code), on);
      } while (!parser.Is(kSemicolon) && !parser.Is(kCloseParen));
    } else {
      parser.FailExpected("push/pop/enable/disable");
    }
    if (!parser.Is(kCloseParen)) parser.Expect(kSemicolon, "; or )");
  }
  parser.DropBehindCurrent();
}

}  // namespace qrex
