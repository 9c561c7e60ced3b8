// The QrexParser operations that tell of warnings, and $warning.

#include <unordered_set>

#include "text/numbers.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

void QrexParser::SeeDeclaration(const NameSpaceElement& element) {
  Message message(Severity::Note, "see declaration of ", PrintedElement(element));
  message.element = message.text;
  file.host.FindSourcePlace(element.position, message.place);
  file.host.Tell(message);
}

void QrexParser::ReportWarning(Warning warning, std::string_view text, const NameSpaceElement* element,
                               const char* address) {
  if (!WarningOn(warning)) return;
  const char* position = address   ? stream.SourcePosition(address)
                         : element ? element->position
                                   : stream.SourcePosition(scanner.begin);
  const int code = static_cast<int>(warning);
  Message message(Severity::Warning, "warning W" + std::to_string(code) + " : ", std::string(text));
  message.code = code;
  if (element) message.element = PrintedElement(*element);
  file.host.FindSourcePlace(position, message.place);
  file.host.Tell(message);
}

void QrexParser::WarnOfText(std::string_view text, const NameSpaceElement& element, const char* address) {
  if (WantsCompilableText()) ReportWarning(Warning::CannotCompile, text, &element, address);
}

void QrexParser::CheckPublicHeader(const NameSpaceElement& element) {
  CheckNotExported(element);
  CheckNotInPublicHeader(element);
}

void QrexParser::CheckNotExported(const NameSpaceElement& element) {
  if (file.file.isPublicHeader && !element.m_exported) {
    ReportWarning(Warning::UnexportedInPublicHeader,
                  PrintedElement(element) + " not exported in public header of library", &element);
  }
}

void QrexParser::CheckNotInPublicHeader(const NameSpaceElement& element) {
  if (!file.file.isPublicHeader && element.m_exported && IsLibrary(GetProject().targetType)) {
    ReportWarning(Warning::ExportedOutsidePublicHeader,
                  PrintedElement(element) + " doesn't appear in public header of library");
  }
}

void QrexParser::CheckMetadata(const NameSpaceElement& element) {
  if (!element.m_reflected && element.ContainsMetaData()) {
    ReportWarning(Warning::MetadataUnreflected, "Non-reflected " + PrintedElement(element) + " contains metadata",
                  &element);
  }
}

void QrexParser::CheckRedundant(const NameSpaceElement& element) {
  if (element.m_reflected) return;
  ReportWarning(Warning::RedundantQualifiers,
                PrintedElement(element) + " is not reflected and has redundant << >> directives", &element);
}

void QrexParser::CheckReferences(const NameSpaceElement& element) {
  if (!element.m_reflected || !element.m_strict || !WarningOn(Warning::ReferenceUnregistered)) return;
  std::vector<const NameSpaceElement*> references;
  element.CollectReferences(references);
  std::unordered_set<const NameSpaceElement*> seen;
  for (const NameSpaceElement* other : references) {
    if (other->GetDeclStatus() == DeclStatus::Forward || other->EffectivelyRegistered()) continue;
    if (!seen.insert(other).second) continue;
    ReportWarning(Warning::ReferenceUnregistered,
                  "Reflected " + PrintedElement(element) + " references non-registered " + PrintedElement(*other),
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
        const auto warning = Warnings::OfCode(code, parser.WantsCompilableText());
        if (!warning) parser.Fail("Invalid warning code : " + ToString(code));
        parser.warnings.Set(*warning, on);
      } while (!parser.Is(kSemicolon) && !parser.Is(kCloseParen));
    } else {
      parser.FailExpected("push/pop/enable/disable");
    }
    if (!parser.Is(kCloseParen)) parser.Expect(kSemicolon, "; or )");
  }
  parser.DropBehindCurrent();
}

}  // namespace qrex
