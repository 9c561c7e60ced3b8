// The QrexParser operations on names, qualifiers and warnings.

#include <algorithm>
#include <unordered_set>

#include "text/numbers.h"
#include "translator/declared/class_def.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

constexpr int kFirstWarning = 1000;
constexpr int kLastWarning = 1017;

void WritePosition(TextWriter& out, const ScannedFile& file, const char* position) {
  std::string path;
  int64_t line;
  if (position && file.host.FindSourcePosition(position, path, line)) out << path << "(" << line << ") : ";
}

}  // namespace

NameSpaceElement* QrexParser::FindName(std::string_view name) {
  NameSpaceElement* element = Current().Lookup(name);
  return element || AtFileScope() ? element : Root().Lookup(name);
}

NameSpaceElement& QrexParser::ParseQualifiedId() {
  NameSpace* scope = Accept(kColonColon) ? &Root() : nullptr;
  for (;;) {
    if (!Is(kIdentifier)) FailExpected("identifier");
    NameSpaceElement* element = scope ? scope->Lookup(current.text.View()) : FindName(current.text.View());
    if (!element) Fail("Unrecognised identifier : " + current.text.Text());
    Advance();
    if (!Is(kColonColon)) return *element;
    if (element->category != Category::NameSpace) {
      Fail(":: not expected here : " + PrintedElement(*element) + " is not a namespace");
    }
    Advance();
    scope = static_cast<NameSpace*>(element);
  }
}

bool QrexParser::ParseExportModifier() {
  if (Is(kPlusPlus)) Fail("'+' modifier repeated");
  if (!Accept(kPlus)) return false;
  if (Is(kPlus) || Is(kPlusPlus)) Fail("'+' modifier repeated");
  return true;
}

void QrexParser::ParseExportModifier(NameSpaceElement& element) { element.SetExported(ParseExportModifier()); }

void QrexParser::ParseQualifierFlags(bool& reflected, bool& registered, std::string_view onWhat,
                                     const std::function<bool(bool on)>& acceptOther) {
  Advance();
  while (!Accept(kShiftRight)) {
    const bool on = !Accept(kMinus);
    if (Is("reflect")) {
      reflected = on;
      if (!on) registered = false;
    } else if (Is("register")) {
      registered = on;
      if (on) reflected = true;
    } else if (!acceptOther || !acceptOther(on)) {
      Fail("Unrecognised qualifier << " + Printed(current) + std::string(onWhat));
    }
    Advance();
  }
}

void QrexParser::ParseQualifiers(NameSpaceElement& element) {
  ParseQualifierFlags(element.m_reflected, element.m_registered, " >> on " + PrintedElement(element));
}

void QrexParser::FailConflict(std::string_view keyword, std::string_view name, const NameSpaceElement& old) {
  SeeDeclaration(old);
  Fail("$" + std::string(keyword) + " " + std::string(name) + " conflicts with previous declaration of " +
       PrintedElement(old));
}

void QrexParser::FailRepeated(const NameSpaceElement& old, const NameSpaceElement& element) {
  SeeDeclaration(old);
  Fail("Repeated definition of " + PrintedElement(element));
}

void QrexParser::Enter(std::unique_ptr<NameSpaceElement> element, ClassDef* enclosing) {
  if (enclosing) {
    enclosing->m_ownedElements.push_back(std::move(element));
  } else {
    Current().Add(std::move(element));
  }
}

void QrexParser::EnterForward(std::unique_ptr<NameSpaceElement> element, const NameSpaceElement* old,
                              const ClassDef* enclosing) {
  const bool isKnown = enclosing ? Current().Sees(element->name) : old != nullptr;
  if (!isKnown) Current().Add(std::move(element));
}

void QrexParser::RequireSemicolonAfter(const NameSpaceElement& element) {
  if (Is(kSemicolon)) return;
  Fail("; expected after definition of " + PrintedElement(element) + " when read " + Printed(current));
}

void QrexParser::SeeDeclaration(const NameSpaceElement& element) {
  TraceWriter trace;
  WritePosition(trace, file, element.position);
  trace << "see declaration of ";
  PrintElement(trace, element);
  trace << "\n";
}

void QrexParser::RequireIObjectImport() {
  if (!file.importsIObject) Fail("@import of IObject.h required");
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
      parser.m_savedWarnings.push_back(parser.m_warnings);
    } else if (parser.AcceptWord("pop")) {
      if (parser.m_savedWarnings.empty()) parser.Fail("$warning pop without matching push");
      parser.m_warnings = parser.m_savedWarnings.back();
      parser.m_savedWarnings.pop_back();
    } else if (parser.Is("enable") || parser.Is("disable")) {
      const bool on = parser.Is("enable");
      parser.Advance();
      parser.Expect(kColon, ":");
      do {
        const int64_t code = parser.ReadInt64();
        if (code < kFirstWarning || code > kLastWarning) parser.Fail("Invalid warning code : " + ToString(code));
        parser.m_warnings[static_cast<size_t>(code - kFirstWarning)] = on;
      } while (!parser.Is(kSemicolon) && !parser.Is(kCloseParen));
    } else {
      parser.FailExpected("push/pop/enable/disable");
    }
    if (!parser.Is(kCloseParen)) parser.Expect(kSemicolon, "; or )");
  }
  parser.DropBehindCurrent();
}

}  // namespace qrex
