// What a name means: a value, a macro with its arguments, an argument that is called as a function, a Python
// macro.

#include "lex/sections.h"
#include "macro/expansion_context.h"
#include "macro/python_bridge.h"

namespace qrex {

static std::shared_ptr<const BodyWords> FindWords(const TextRange& body, const NamesInUse& names, Dialect dialect) {
  auto found = std::make_shared<BodyWords>(BodyWords{names.Changes(), dialect, false, {}});
  if (body.View().find('\n') != std::string_view::npos) return found;
  try {
    LexScanner scanner(body, dialect);
    for (LexToken token; token.kind != kEndOfText;) {
      ReadToken(scanner, token, true);
      if (token.kind == kEndOfText || IsPlainToken(token, names)) continue;
      if (token.kind == kAt ? NextToken(scanner).kind != kAt : token.kind != kIdentifier) return found;
      found->words.push_back({token.kind, static_cast<size_t>(token.text.begin - body.begin), token.text.Size()});
    }
    found->isComplete = true;
  } catch (const LexScannerException&) {  // reported at the call
  }
  return found;
}

std::shared_ptr<const BodyWords> LSMacroVariable::WordsOfBody(const NamesInUse& names, Dialect dialect) const {
  if (m_scans < kScansAhead) {
    ++m_scans;
    return nullptr;
  }
  if (!m_words || m_words->asOf != names.Changes() || m_words->dialect != dialect) {
    m_scans = 0;  // names that come between all calls must not cost a scan more for each
    m_words = FindWords(body, names, dialect);
  }
  return m_words->isComplete ? m_words : nullptr;
}

void ExpansionContext::CallAndNote(LSVariable& variable) {
  const NotedCall noted(m_sink, AnchorForTemporary()->begin);
  CallVariable(variable);
}

void ExpansionContext::CallVariable(LSVariable& variable) {
  if (variable.Kind() != VarType::Macro) {
    DropToScanner();
    return EmitGenerated(variable.ValueText());
  }
  const auto& macro = static_cast<const LSMacroVariable&>(variable);
  // What the body defines may replace the entry, but a frame keeps its variables to its end.
  if (macro.isFunctionArgument) return CallFunctionArgument(macro);
  if (macro.formals.empty() && macro.HasPlainBody(m_world.names)) {
    DropToScanner();
    return CopyBody(macro);
  }
  CallMacro(macro);
}

ExpansionContext::BoundArguments ExpansionContext::ReadArguments(const LSMacroVariable& macro) {
  BoundArguments arguments;
  if (macro.formals.empty()) return arguments;
  const LexToken open = Next();
  if (open.kind != kOpenParen) {
    FailAt(open, "( expected to begin argument list for macro " + macro.Signature() + " when read " + Printed(open));
  }
  for (const MacroFormal& formal : macro.formals) {
    TextRange text;
    bool isPlain = true;
    const LexToken end = ReadArgument(m_scanner, text, kCloseParen, [&](const LexToken& token) {
      isPlain = isPlain && IsPlainToken(token, m_world.names);
    });
    const bool isLast = &formal == &macro.formals.back();
    if (!isLast && end.kind == kCloseParen) {
      FailAt(end, "Insufficient arguments provided for macro " + macro.Signature());
    }
    if (isLast && end.kind == kComma) FailAt(end, "Too many arguments provided for macro " + macro.Signature());
    arguments.push_back({&formal, text, isPlain});
  }
  return arguments;
}

// Untyped: the text, which is expanded where it was written, at each use. Typed: its value now.
void ExpansionContext::BindArgument(LSFrame& frame, const BoundArgument& argument, const LSMacroVariable& macro) {
  const MacroFormal& formal = *argument.formal;
  if (formal.type != VarType::Macro) {
    std::string value;
    try {
      value = EvaluateAsText(m_frame, argument.text, formal.type, m_anchor);
    } catch (LexScannerException& exception) {
      exception.message += "\n    passing formal argument " + formal.name.Text() + " to macro " + macro.name.Text();
      throw;
    }
    auto variable = std::make_unique<LSValueVariable>(formal.type, std::move(value));
    variable->name = formal.name;
    frame.AddVariable(std::move(variable));
    return;
  }
  auto variable = std::make_unique<LSMacroVariable>();
  variable->name = formal.name;
  variable->body = argument.text;
  variable->homeFrame = &m_frame;
  variable->isFunctionArgument = formal.isFunction;
  variable->isTemporary = m_anchor != nullptr;
  if (argument.isPlain) variable->SetPlainBody(m_world.names);
  // An argument of a naked macro stays in the frame, which may outlive the text.
  if (m_anchor && macro.isNaked) variable->OwnBody();
  frame.AddVariable(std::move(variable));
}

void ExpansionContext::CallMacro(const LSMacroVariable& macro) {
  const BoundArguments arguments = ReadArguments(macro);
  DropToScanner();
  LSFrame callFrame(macro.homeFrame ? macro.homeFrame : &m_frame);
  LSFrame& frame = macro.isNaked ? m_frame : callFrame;
  for (const BoundArgument& argument : arguments) BindArgument(frame, argument, macro);
  try {
    RunBody(macro, frame);
  } catch (LexScannerException& exception) {
    exception.message += "\n    invoking macro " + macro.Signature();
    std::string_view separator = " with ";
    for (const BoundArgument& argument : arguments) {
      exception.message.append(separator).append(argument.formal->name.View()).append("=");
      exception.message.append(argument.text.View());
      separator = ", ";
    }
    throw;
  }
}

void ExpansionContext::RunBody(const LSMacroVariable& macro, LSFrame& frame) {
  if (macro.isPython) {
    const std::string expression =
        ExpandAside(frame, macro.body, macro.stripIndent, macro.isTemporary ? AnchorForTemporary() : nullptr);
    try {
      EmitGenerated(EvalPython(expression, m_tokenText.begin));
    } catch (LexScannerException& exception) {
      exception.message += "\n    invoking python macro " + macro.name.Text();
      throw;
    }
  } else if (macro.resultType != VarType::Macro) {
    const TextRange* anchor = macro.isTemporary ? AnchorForTemporary() : nullptr;
    EmitGenerated(EvaluateAsText(frame, macro.body, macro.resultType, anchor));
  } else if (!macro.body.Empty()) {
    ExpandBody(macro, frame);
  }
}

void ExpansionContext::ExpandBody(const LSMacroVariable& macro, LSFrame& frame) {
  if (macro.HasPlainBody(m_world.names)) return CopyBody(macro);
  const TextRange* anchor = macro.isTemporary ? AnchorForTemporary() : nullptr;
  const Dialect dialect = frame.FileFrame() ? frame.FileFrame()->dialect : Dialect::Qrex;
  ExpansionContext body(nullptr, frame, macro.body, macro.stripIndent, CurrentColumn(), m_sink, anchor,
                        macro.WordsOfBody(m_world.names, dialect));
  body.Run();
  if (body.WasPlain()) macro.SetPlainBody(m_world.names);
}

void ExpansionContext::CopyBody(const LSMacroVariable& macro) {
  CheckPart(macro.body);
  CopySource(macro.body, CurrentColumn(), macro.isTemporary ? AnchorForTemporary() : nullptr);
}

void ExpansionContext::CallFunctionArgument(const LSMacroVariable& macro) {
  const LexToken open = Next();
  if (open.kind != kOpenParen) {
    FailAt(open, "( expected to begin argument list for macro " + macro.Signature() + " when read " + Printed(open));
  }
  const TextRange raw = ReadParenSection(m_scanner, true);
  DropToScanner();
  const std::string arguments = ExpandAside(m_frame, raw, 0, m_anchor);
  const std::string call = macro.body.Text() + "(" + arguments + ")";
  LSFrame& home = macro.homeFrame ? *macro.homeFrame : m_frame;
  try {
    ExpansionContext(nullptr, home, TextRange(std::string_view(call)), 0, CurrentColumn(), m_sink, AnchorForTemporary())
        .Run();
  } catch (LexScannerException& exception) {
    ForgetPosition(exception, call);
    throw;
  }
}

}  // namespace qrex
