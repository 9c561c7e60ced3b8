// @if, @while, @for, @scope, @else, @runpython.

#include "lex/sections.h"
#include "macro/expansion_context.h"
#include "macro/python_bridge.h"

namespace qrex {

namespace {

// On a copy of the scanner: `@` and the word, with comments and line ends between at will.
bool Probe(LexScanner& scanner, std::string_view word) {
  LexScanner ahead = scanner;
  if (NextToken(ahead).kind != kAt) return false;
  const LexToken token = NextToken(ahead);
  if (token.kind != kIdentifier || !(token.text == word)) return false;
  scanner = ahead;
  return true;
}

// Reads a block; a failure gets the directive's context line.
TextRange ReadBlockOf(LexScanner& scanner, std::string_view directive, int& indent) {
  try {
    return ReadBraceBlock(scanner, indent);
  } catch (LexScannerException& exception) {
    exception.message.append("\n    for ").append(directive).append(" directive");
    throw;
  }
}

}  // namespace

// All conditions are evaluated, also behind the branch that is taken, and so can fail.
void ExpansionContext::If() {
  TextRange selected;
  int selectedIndent = 0;
  bool found = false;
  auto readBranch = [&](std::string_view name) {
    const bool holds = EvaluateCondition(ReadExpressionText(false), name);
    int indent;
    const TextRange block = ReadBraceBlock(m_scanner, indent);
    if (!holds || found) return;
    found = true;
    selected = block;
    selectedIndent = indent;
  };
  readBranch("@if");
  while (Probe(m_scanner, "elseif")) readBranch("@elseif");
  if (Probe(m_scanner, "else")) {
    int indent;
    const TextRange block = ReadBraceBlock(m_scanner, indent);
    if (!found) {
      selected = block;
      selectedIndent = indent;
    }
  }
  DropToScanner();
  LSFrame child(&m_frame);
  ExpandBlock(selected, child, selectedIndent, CurrentColumn());
}

void ExpansionContext::Else() { throw LexScannerException("@else with no matching @if directive", m_tokenText); }

void ExpansionContext::While() {
  const TextRange condition = ReadExpressionText(false);
  int indent;
  const TextRange block = ReadBlockOf(m_scanner, "@while", indent);
  DropToScanner();
  const LineIndent column = CurrentColumn();
  for (int64_t i = 0; EvaluateCondition(condition, "@while"); ++i) {
    if (i == m_world.limits.iterations)
      throw LexScannerException("Too many iterations in @while directive", m_tokenText);
    LSFrame child(&m_frame);
    ExpandBlock(block, child, indent, column);
  }
}

void ExpansionContext::Scope() {
  int indent;
  const TextRange block = ReadBraceBlock(m_scanner, indent);
  DropToScanner();
  LSFrame child(&m_frame);
  ExpandBlock(block, child, indent, CurrentColumn());
}

// Python minds indentation: that of the first statement goes from every line, wherever the braces are. Answers how
// many blank lines stood ahead of it.
static size_t SkipToFirstStatement(TextRange& block, int& indent) {
  size_t lines = 0;
  int columns = 0;
  for (; !block.Empty() && std::string_view(" \t\n").find(*block.begin) != std::string_view::npos; ++block.begin) {
    if (*block.begin == '\n') ++lines;
    columns = *block.begin == '\n' ? 0 : columns + (*block.begin == '\t' ? kTabWidth : 1);
    indent = columns;
  }
  return lines;
}

void ExpansionContext::RunPython() {
  LexScanner scanner = m_scanner;
  int indent;
  TextRange block = ReadBraceBlock(scanner, indent);
  const size_t blankLines = SkipToFirstStatement(block, indent);
  if (!block.Empty()) {
    const std::string code = std::string(blankLines, '\n') + ExpandPart(block, indent) + "\n";  // Python counts lines
    try {
      qrex::RunPython("", code, m_tokenText.begin);
    } catch (LexScannerException& exception) {
      exception.message += "\n    in @runpython()\n";
      throw;
    }
  }
  m_scanner = scanner;
  DropToScanner();
}

// --- @for

struct ExpansionContext::Loop {
  bool isTuple = false;
  std::vector<TextRange> variables;
  TextRange list;
  std::string elements;  // the list, expanded
  TextRange block;
  int indent = 0;
  LineIndent column;
};

ExpansionContext::Loop ExpansionContext::ReadLoopHead() {
  Loop loop;
  const LexToken open = Next();
  if (open.kind != kOpenParen) FailAt(open, WithToken("( expected after @for when read ", open));
  LexToken token = Next();
  loop.isTuple = token.kind == kOpenParen;
  if (!loop.isTuple) {
    if (token.kind != kIdentifier) FailAt(token, WithToken("Identifier expected after @for( when read ", token));
    loop.variables.push_back(token.text);
  } else {
    do {
      loop.variables.push_back(RequireIdentifier("Identifier expected when read ").text);
      token = Next();
      if (token.kind != kComma && token.kind != kCloseParen)
        FailAt(token, WithToken(", or ) expected when read ", token));
    } while (token.kind == kComma);
  }
  token = Next();
  if (token.kind != kIdentifier || !token.Is("in")) FailAt(token, WithToken("'in' expected when read ", token));
  loop.list = ReadParenSection(m_scanner, true);
  loop.elements = ExpandPart(loop.list);
  loop.block = ReadBlockOf(m_scanner, "@for", loop.indent);
  return loop;
}

void ExpansionContext::For() {
  Loop loop = ReadLoopHead();
  DropToScanner();
  loop.column = CurrentColumn();
  try {
    RunLoop(loop);
  } catch (LexScannerException& exception) {
    if (exception.position == loop.list.begin && exception.hint.empty()) exception.hint = ListHint(loop);
    ForgetPosition(exception, loop.elements);
    throw;
  }
}

// For an error in a list: where the macro is that holds it.
std::string ExpansionContext::ListHint(const Loop& loop) const {
  LexScanner scanner(loop.list, m_scanner.dialect);
  const LexToken name = NextToken(scanner);
  if (name.kind != kIdentifier || !m_handler) return {};
  const LSVariable* variable = m_frame.Find(name.text.View(), name.text.begin);
  if (!variable) return "there is no macro " + name.text.Text() + "; a list is [a, b] or a macro that holds one";
  const std::string place = m_handler->PlaceOf(variable->name.begin);
  return place.empty() ? "" : "the list is " + name.text.Text() + ", which stands at " + place;
}

void ExpansionContext::RunLoop(const Loop& loop) {
  LexScanner scanner(std::string_view(loop.elements), m_scanner.dialect);
  const LexToken open = NextToken(scanner);
  if (open.kind != kOpenBracket) {
    throw LexScannerException(WithToken("[ expected when read read ", open), loop.list);
  }
  for (;;) {
    TextRange element;
    LexToken end;
    try {
      end = ReadArgument(scanner, element, kCloseBracket);
    } catch (LexScannerException& exception) {
      exception.position = loop.list.begin;
      exception.message += "\n    in @for directive for list " + loop.elements;
      throw;
    }
    if (end.kind == kComma || !element.Empty()) {
      LSFrame frame(&m_frame);
      try {
        BindElement(loop, element, frame);
      } catch (LexScannerException& exception) {
        exception.position = loop.list.begin;
        throw;
      }
      try {
        ExpandBlock(loop.block, frame, loop.indent, loop.column);
      } catch (LexScannerException& exception) {
        exception.message +=
            "\n    in @for directive when " + (loop.isTuple ? "" : loop.variables[0].Text()) + " = " + element.Text();
        throw;
      }
    }
    if (end.kind == kCloseBracket) return;
    if (end.kind != kComma) throw LexScannerException(WithToken(", or ] expected when read ", end), loop.list);
  }
}

// An element is text, not a value: it is expanded wherever the variable is used, in the frame of the @for.
void ExpansionContext::BindElement(const Loop& loop, const TextRange& element, LSFrame& frame) {
  auto bind = [&](const TextRange& name, const TextRange& text) {
    auto variable = std::make_unique<LSMacroVariable>();
    variable->name = name;
    variable->body = text;
    variable->homeFrame = &m_frame;
    variable->isTemporary = true;
    frame.AddVariable(std::move(variable));
  };
  if (!loop.isTuple) return bind(loop.variables[0], element);
  LexScanner scanner(element, m_scanner.dialect);
  const LexToken open = NextToken(scanner);
  if (open.kind != kOpenParen) throw LexScannerException(WithToken("( expected when read ", open), loop.list);
  for (size_t i = 0; i < loop.variables.size(); ++i) {
    TextRange text;
    const LexToken end = ReadArgument(scanner, text, kCloseParen);
    const bool isLast = i + 1 == loop.variables.size();
    if (end.kind != (isLast ? kCloseParen : kComma)) {
      throw LexScannerException(WithToken(isLast ? ") expected when read " : ", expected when read ", end), loop.list);
    }
    bind(loop.variables[i], text);
  }
}

}  // namespace qrex
