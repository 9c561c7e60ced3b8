// The QrexParser operations on names and qualifiers.

#include "translator/declared/class_def.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

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

void QrexParser::RequireIObjectImport() {
  if (!file.importsIObject) Fail("@import of IObject.h required");
}

}  // namespace qrex
