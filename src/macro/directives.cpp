// The directives that read an expression or a text, and the table of all of them.

#include "macro/directives.h"

#include "lex/cpp_literals.h"
#include "lex/literals.h"
#include "lex/sections.h"
#include "macro/directive_expression.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/trace.h"

namespace qrex {

std::span<const Directive> Directive::All() {
  using C = ExpansionContext;
  static const Directive kDirectives[] = {
      {"if", Line::Kept, &C::If},
      {"for", Line::Kept, &C::For},
      {"let", Line::DroppedWhole, &C::Let},
      {"def", Line::DroppedWhole, &C::Def},
      {"import", Line::OfItsOwn, &C::Import},
      {"str", Line::Kept, &C::StrPlain},
      {"strx", Line::Kept, &C::StrLines},
      {"strW", Line::Kept, &C::StrWide},
      {"strxW", Line::Kept, &C::StrWideLines},
      {"unstr", Line::Kept, &C::Unstr},
      {"quote", Line::Kept, &C::Quote},
      {"scope", Line::Kept, &C::Scope},
      {"while", Line::Kept, &C::While},
      {"else", Line::Kept, &C::Else},
      {"importpath", Line::Dropped, &C::ImportPath},
      {"relativepath", Line::Dropped, &C::RelativePathDirective},
      {"print", Line::DroppedWhole, &C::PrintPlain},
      {"println", Line::DroppedWhole, &C::PrintLine},
      {"assert", Line::DroppedWhole, &C::Assert},
      {"assertfails", Line::DroppedWhole, &C::AssertFails},
      {"fail", Line::DroppedWhole, &C::FailDirective},
      {"exportdef", Line::DroppedWhole, &C::ExportDef},
      {"nakeddef", Line::DroppedWhole, &C::NakedDef},
      {"defpython", Line::DroppedWhole, &C::DefPython},
      {"runpython", Line::DroppedWhole, &C::RunPython},
  };
  return kDirectives;
}

const Directive* Directive::Find(std::string_view word) {
  for (const Directive& directive : All()) {
    if (directive.word == word) return &directive;
  }
  return nullptr;
}

// --- Expressions

std::string ExpansionContext::ExpandCondition(const TextRange& raw, std::string_view name) {
  try {
    return ExpandExpression(raw);
  } catch (LexScannerException& exception) {
    exception.message += "\n    in " + std::string(name) + "(" + raw.Text() + ")";
    throw;
  }
}

bool ExpansionContext::EvaluateCondition(const TextRange& raw, std::string_view name) {
  return ReadExpression(ExpandCondition(raw, name), std::string(name) + "(", ")", m_tokenText.begin,
                        [](ExpressionParser& parser) { return parser.ReadBool(); });
}

std::string ExpansionContext::EvaluateString(const TextRange& raw, std::string_view name) {
  return ReadExpression(ExpandCondition(raw, name), std::string(name) + "(", ")", m_tokenText.begin,
                        [](ExpressionParser& parser) { return parser.ReadStringValue(); });
}

void ExpansionContext::ParenExpression() {
  const TextRange raw = ReadExpressionText(true);
  DropToScanner();
  const std::string expansion = ExpandExpression(raw);
  EmitGenerated(ReadExpression(
      expansion, "@(", ")", m_tokenText.begin, [](ExpressionParser& parser) { return parser.ReadStringValue(true); },
      "when read "));
}

void ExpansionContext::DoubleExpansion() {
  const TextRange raw = ReadBracketSection(m_scanner, true);
  DropToScanner();
  const std::string once = ExpandPart(raw);
  std::string twice;
  try {
    LSFrame child(&m_frame);
    twice = ExpandAside(child, TextRange(std::string_view(once)), 0, AnchorForTemporary());
  } catch (LexScannerException& exception) {
    PatchExpressionError(exception, "@[", once, "]", m_tokenText.begin);
    throw;
  }
  EmitGenerated(twice);
}

// --- Strings

void ExpansionContext::Str(bool wide, bool breakLines) {
  int indent;
  const TextRange raw = ReadParenBlock(m_scanner, indent);
  DropToScanner();
  const std::string text = ExpandPart(raw, indent);
  const LineIndent column = CurrentColumn();
  const std::string opening = wide ? "L\"" : "\"";
  std::string literal = opening;
  bool broke = false;
  for (char c : text) {
    if (c == '\n' && breakLines) {
      EmitGenerated(literal + "\\n\"\n", column);
      literal = opening;
      broke = true;
    } else {
      WriteEscapedChar(literal, c);
    }
  }
  literal += '"';
  if (!broke || literal.size() >= 3) EmitGenerated(literal, column);
}

void ExpansionContext::Unstr() {
  const TextRange raw = ReadParenSection(m_scanner, false);
  DropToScanner();
  const std::string expansion = ExpandPart(raw);
  std::string text;
  try {
    LexScanner scanner{std::string_view(expansion)};
    ReadQuotedText(scanner, text);
  } catch (LexScannerException& exception) {
    PatchExpressionError(exception, "@unstr(", expansion, ")", m_tokenText.begin);
    throw;
  }
  EmitGenerated(text, CurrentColumn());
}

void ExpansionContext::Quote() {
  int indent;
  const TextRange raw = ReadParenBlock(m_scanner, indent);
  DropToScanner();
  const LineIndent column = CurrentColumn();
  LexScanner behind = m_scanner;
  m_scanner = LexScanner(raw, behind.dialect);
  while (!m_scanner.AtEnd()) {
    const size_t lineFeed = m_scanner.View().find('\n');
    const char* end = lineFeed == std::string_view::npos ? m_scanner.end : m_scanner.begin + lineFeed + 1;
    CopySource({m_scanner.begin, end}, column, m_anchor);
    m_scanner.begin = end;
    StripIndentation(indent);
  }
  m_scanner = behind;
}

// --- Messages and checks

void ExpansionContext::Print(bool endLine) {
  const TextRange raw = ReadParenSection(m_scanner, false);
  DropToScanner();
  std::string text = ExpandPart(raw);
  if (endLine) text += '\n';
  try {
    WriteToConsole(text);
  } catch (const StringConversionException& exception) {
    throw LexScannerException(ExceptionText(exception), m_tokenText);
  }
}

void ExpansionContext::Assert() {
  const char* const position = m_scanner.begin;
  const TextRange raw = ReadExpressionText(false);
  const std::string expansion = ExpandCondition(raw, "@assert");
  const bool holds = ReadExpression(expansion, "@assert(", ")", m_tokenText.begin,
                                    [](ExpressionParser& parser) { return parser.ReadBool(); });
  if (holds) return;
  throw LexScannerException(
      "Assertion failure\n        @assert(" + raw.Text() + ")\nie      @assert(" + expansion + ")", position);
}

void ExpansionContext::AssertFails() {
  const LexToken open = Next();
  if (open.kind != kOpenParen && open.kind != kOpenBracket && open.kind != kOpenBrace) {
    FailAt(open, WithToken("( expected after @assertfails when read ", open));
  }
  const TextRange raw = ReadSection(m_scanner, true, open.kind, open.kind + 1);
  try {
    ExpandPart(raw);
  } catch (const LexScannerException&) {
    return;
  }
  FailAt(open, "Macro expansion of " + raw.Text() + " didn't generate an error");
}

void ExpansionContext::FailDirective() {
  const char* const position = m_scanner.begin;
  throw LexScannerException(EvaluateString(ReadExpressionText(false), "@fail"), position);
}

// --- Imports and paths

// A double-quoted string, or `(` and a string expression. Fails with "Quoted string expected `what`".
std::string ExpansionContext::ReadStringOrExpression(std::string_view what, bool& wasExpression, LexToken& token) {
  token = Next();
  wasExpression = token.kind == kOpenParen;
  std::string text;
  if (token.kind == kDoubleQuoted) {
    DecodeString(token, m_scanner.dialect, text);
  } else if (wasExpression) {
    text = EvaluateString(ReadExpressionText(true), "@" + std::string(what));
  } else {
    FailAt(token, "Quoted string expected after '" + std::string(what) + "' when read " + Printed(token));
  }
  return text;
}

// The directive's text stays in the output: the language behind the macro layer acts on it as well.
void ExpansionContext::Import() {
  if (!m_handler) throw LexScannerException("@import statement not allowed here", m_tokenText);
  bool wasExpression;
  LexToken token;
  const std::string path = ReadStringOrExpression("import", wasExpression, token);
  if (wasExpression) {
    Settle();
    DropToScanner();
    EmitGenerated("@import \"" + path + "\"");
  }
  if (!m_handler->Import(m_frame, path, token.text.begin)) {
    throw LexScannerException("Can't import file: " + path, token).WithHint(m_handler->ImportHint(path));
  }
}

void ExpansionContext::ImportPath() {
  if (!m_handler) throw LexScannerException("@importpath statement not allowed here", m_tokenText);
  bool wasExpression;
  LexToken token;
  const std::string path = ReadStringOrExpression("importpath", wasExpression, token);
  DropToScanner();
  if (!m_handler->ImportPath(path, token.text.begin)) FailAt(token, "@importpath directive not supported");
}

void ExpansionContext::RelativePathDirective() {
  constexpr std::string_view kName = "@relativepath";
  const LexToken open = Next();
  if (open.kind != kOpenParen) FailAt(open, WithToken("( expected after @relativepath when read ", open));
  TextRange target, base;
  const LexToken comma = ReadArgument(m_scanner, target, kCloseParen);
  if (comma.kind != kComma) {
    FailAt(comma, WithToken("Comma expected in @relativepath directive when read ", comma));
  }
  const LexToken close = ReadArgument(m_scanner, base, kCloseParen);
  if (close.kind != kCloseParen) {
    FailAt(close, WithToken(") expected  in @relativepath directive when read ", close));
  }
  const std::string targetPath = NormalisePath(EvaluateString(target, kName));
  const std::string basePath = NormalisePath(EvaluateString(base, kName));
  DropToScanner();
  EmitGenerated("\"" + EscapedString(RelativePath(targetPath, basePath)) + "\"");
}

void ExpansionContext::DefineSubstitution() {
  Settle();
  DropTo(m_here);
  const LexToken nameToken = RequireIdentifier("Identifier expected after @let when read ");
  const std::string name = nameToken.text.Text();
  const LexToken assign = Next();
  if (assign.kind != kAssign) {
    FailAt(assign, "= expected in definition of macro " + name + " when read " + Printed(assign));
  }
  const LexToken token = Next();
  std::string value;
  if (token.kind == kDoubleQuoted) {
    DecodeString(token, m_scanner.dialect, value);
  } else if (token.kind == kOpenParen) {
    value = EvaluateString(ReadExpressionText(true), "@$");
  } else {
    FailAt(token, "Quoted string expected after $" + name + " definition when read " + Printed(token));
  }
  if (!m_frame.FileFrame()) FailAt(nameToken, "No filescope frame");
  m_frame.FileFrame()->DefineSubstitution(name, value);
  DropToScanner();
}

}  // namespace qrex
