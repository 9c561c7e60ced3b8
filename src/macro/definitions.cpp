// @let, and the four forms of macro definition.

#include "lex/sections.h"
#include "macro/expansion_context.h"

namespace qrex {

void ExpansionContext::AddValue(const TextRange& name, VarType type, std::string value) {
  if (m_anchor) {
    m_frame.AddVariable(std::make_unique<LSVar>(name.Text(), type, std::move(value)));
    return;
  }
  auto variable = std::make_unique<LSValueVariable>(type, std::move(value));
  variable->name = name;
  m_frame.AddVariable(std::move(variable));
}

void ExpansionContext::Let() {
  LexToken token = Next();
  VarType type = token.kind == kIdentifier ? TypeCodeOf(token.text.View()) : VarType::Macro;
  const bool isDeclaration = type != VarType::Macro;
  LSVariable* assigned = nullptr;
  if (isDeclaration) {
    token = RequireIdentifier("Identifier expected for macro name when read ");
    if (m_frame.FindInFrame(token.text.View(), token.text.begin)) {
      FailAt(token, "Redefinition of variable " + token.text.Text() + " in this scope");
    }
  } else {
    if (token.kind != kIdentifier) FailAt(token, WithToken("Identifier expected after @let when read ", token));
    assigned = m_frame.Find(token.text.View(), token.text.begin);
    if (!assigned) FailAt(token, "@let directive failed : there is no variable named " + token.text.Text());
    type = assigned->Kind();
    if (type == VarType::Macro) {
      FailAt(token, "@let directive failed : " + token.text.Text() + " is a macro declared using @def");
    }
  }
  const std::string name = token.text.Text();
  LexToken assign = Next();
  const bool isVerbatim = assign.kind == kColon;
  if (isVerbatim) assign = Next();
  if (assign.kind != kAssign) {
    FailAt(assign, "= expected in definition of macro " + name + " when read " + Printed(assign));
  }
  int indent;
  const TextRange text = ReadBraceBlock(m_scanner, indent);

  std::string value;
  if (isVerbatim) {
    if (type != VarType::String)
      FailAt(token, "@let directive failed: " + name + " := may only be used for string type");
    value = ExpandPart(text, indent);
  } else {
    try {
      value = EvaluateAsText(m_frame, text, type, m_anchor);
    } catch (LexScannerException& exception) {
      if (assigned) exception.message += "\n    when parsing expression '" + text.Text() + "' for @let directive";
      if (!exception.position && m_handler && exception.hint.empty()) {
        const std::string place = m_handler->PlaceOf(token.text.begin);
        if (!place.empty()) exception.hint = "in the @let at " + place;
      }
      throw;
    }
  }
  if (assigned) {
    static_cast<LSValueVariable*>(assigned)->value = std::move(value);
  } else {
    AddValue(token.text, type, std::move(value));
  }
}

void ExpansionContext::DefineMacro(bool exported, bool naked, bool python) {
  auto macro = std::make_unique<LSMacroVariable>();
  macro->isNaked = naked;
  macro->isPython = python;
  LexToken token = Next();
  const bool fileScope = token.kind == kPlus;
  if (fileScope) token = Next();
  if (token.kind == kIdentifier) {
    macro->resultType = TypeCodeOf(token.text.View());
    if (macro->resultType != VarType::Macro) token = Next();
  }
  if (token.kind != kIdentifier) FailAt(token, WithToken("Identifier expected for macro name when read ", token));
  macro->name = token.text;
  const std::string name = token.text.Text();

  token = Next();
  if (token.kind == kOpenParen) {
    ReadFormals(*macro);
    token = Next();
    if (token.kind != kAssign)
      FailAt(token, "= expected in definition of macro " + name + " when read " + Printed(token));
  } else if (token.kind != kAssign) {
    FailAt(token, "= or ( expected for definition of macro " + name + " when read " + Printed(token));
  }
  macro->body = ReadBraceBlock(m_scanner, macro->stripIndent);
  AddMacro(std::move(macro), fileScope, exported);
}

// From behind the `(` to behind the `)`.
void ExpansionContext::ReadFormals(LSMacroVariable& macro) {
  const std::string name = macro.name.Text();
  LexToken token = Next();
  if (token.kind == kCloseParen) return;
  for (;; token = Next()) {
    MacroFormal formal;
    if (token.kind == kIdentifier) {
      formal.type = TypeCodeOf(token.text.View());
      if (formal.type != VarType::Macro) token = Next();
    }
    if (token.kind != kIdentifier) {
      FailAt(token, "Read " + Printed(token) + " while trying to read argument for definition of macro " + name);
    }
    formal.name = token.text;
    for (const MacroFormal& other : macro.formals) {
      if (other.name == formal.name) {
        FailAt(token, "Repeated argument " + token.text.Text() + " in definition of macro " + name);
      }
    }
    if (token.Is("true") || token.Is("false")) {
      FailAt(token, "Invalid formal argument '" + token.text.Text() + "' in definition of macro " + name);
    }
    token = Next();
    if (token.kind == kOpenParen) {
      token = Next();
      if (token.kind != kCloseParen) FailAt(token, WithToken("Expected ) when read ", token));
      formal.isFunction = true;
      token = Next();
    }
    macro.formals.push_back(formal);
    if (token.kind == kCloseParen) return;
    if (token.kind != kComma) {
      FailAt(token, "Comma or right parenthesis expected when read " + Printed(token) +
                        "\nwhile reading argument list for definition of macro " + name);
    }
  }
}

void ExpansionContext::AddMacro(std::unique_ptr<LSMacroVariable> macro, bool fileScope, bool exported) {
  LSFrame* frame = fileScope ? m_frame.FileFrame() : exported ? m_frame.Parent() : &m_frame;
  if (!frame) throw LexScannerException(fileScope ? "No filescope frame" : "No parent frame", macro->name);
  if (m_anchor) {
    macro->isTemporary = true;
    macro->OwnText({macro->name.begin, m_scanner.begin});
  }
  frame->AddVariable(std::move(macro));
}

}  // namespace qrex
