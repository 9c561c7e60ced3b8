// The state of one run of the expansion loop over one text, shared by the loop (expand.cpp), the directives
// (directives.cpp, control_directives.cpp, definitions.cpp) and the macro call (macro_call.cpp).
//
// Source text that passes through is not copied token by token: what lies between `m_pendingBegin` and `m_settled` is
// due for the output and goes there in one run, when something other is to be written or dropped.
#pragma once

#include <boost/container/small_vector.hpp>
#include <memory>
#include <string>

#include "lex/scanner.h"
#include "macro/expand.h"
#include "macro/expression_parser.h"
#include "platform/system.h"

namespace qrex {

class ExpansionContext {
 public:
  // `anchor`: for a text composed on the way, the source that stands for it in the map (it may end before the map and
  // before a macro that it defines). Null for source text.
  ExpansionContext(ImportHandler* handler, LSFrame& frame, const TextRange& text, int64_t stripIndent,
                   LineIndent outIndent, ExpansionSink& sink, const TextRange* anchor,
                   std::shared_ptr<const BodyWords> words = nullptr);
  // Expressions of directives are no text of their file: they are read in the one dialect of all expressions.
  void ReadAsExpression() { m_scanner.dialect = Dialect::Qrex; }
  ~ExpansionContext();
  ExpansionContext(const ExpansionContext&) = delete;
  ExpansionContext& operator=(const ExpansionContext&) = delete;
  void Run();
  // After Run: every token is plain, whatever frame it is looked up in.
  bool WasPlain() const { return m_isPlain; }
  bool RunUnlessPlain();  // false: nothing in the text is to be changed, and nothing was written but the map

 private:
  friend struct Directive;
  static constexpr int kMaxNesting = 1000;

  // --- Loop
  void RunToEnd();
  bool ReadPastPlain(LexToken& found);
  template <Dialect dialect>
  bool ReadPastPlainIn(LexToken& found);
  bool ReadToWord(LexToken& found);  // the same where the words are known
  void SkipToToken();
  void ExpandIdentifier(const LexToken& token);
  void SubstituteInString(const LexToken& token);
  void CopyRawString(const LexToken& token);
  void ExpandAt();
  bool ExpandPredefined(const LexToken& name);

  // --- Output
  void Settle() { FlushTo(m_settled); }
  void FlushTo(const char* position);
  void DropTo(const char* position);
  void DropToScanner() { DropTo(m_scanner.begin); }
  void EmitGenerated(std::string_view text) { EmitGenerated(text, m_outIndent); }
  void EmitGenerated(std::string_view text, LineIndent column);  // where its lines but the first begin
  void CheckPart(const TextRange& text) const {
    if (m_world.nesting >= kMaxNesting || platform::IsStackShort())
      throw LexScannerException("Macro expansion nested too deeply", text.begin);
    if (m_world.nesting == 0) m_world.parts = 0;
    if (++m_world.parts > m_world.limits.parts) throw LexScannerException("Too many macro expansions", text.begin);
    CheckLength(text.Size());
  }
  void CheckLength(size_t added) const {
    if (static_cast<int64_t>(m_sink.bytesOutside + m_sink.Bytes() + added) <= m_world.limits.bytes) return;
    throw LexScannerException("Expanded text is too long", m_tokenText);
  }
  LineIndent CurrentColumn() const { return m_sink.AtLineStart() ? m_outIndent : m_sink.ColumnHere(); }
  const TextRange* AnchorForTemporary() const { return m_anchor ? m_anchor : &m_tokenText; }
  void StripIndentation(int64_t width);
  void SwallowLine();

  // --- Expansion of parts of the text
  void ExpandBlock(const TextRange& block, LSFrame& frame, int indent, LineIndent column);
  std::string ExpandPart(const TextRange& part, int64_t stripIndent = 0);  // in a child frame
  std::string ExpandExpression(const TextRange& part);                     // the same
  TextRange ReadExpressionText(bool openAlreadyRead);                      // in parentheses
  // To the sink, unchanged.
  void CopySource(const TextRange& text, LineIndent indent, const TextRange* anchor);
  LexToken Next() { return NextToken(m_scanner); }
  LexToken RequireIdentifier(std::string_view message);  // fails with the message and the token
  [[noreturn]] void FailAt(const LexToken& token, std::string message) const;

  // --- Expressions of directives
  std::string ExpandCondition(const TextRange& raw, std::string_view name);
  bool EvaluateCondition(const TextRange& raw, std::string_view name);
  std::string EvaluateString(const TextRange& raw, std::string_view name);
  std::string ReadStringOrExpression(std::string_view what, bool& wasExpression, LexToken& token);

  // --- Directives
  void Import();
  void ImportPath();
  void RelativePathDirective();
  void Str(bool wide, bool breakLines);
  void StrPlain() { Str(false, false); }
  void StrLines() { Str(false, true); }
  void StrWide() { Str(true, false); }
  void StrWideLines() { Str(true, true); }
  void Unstr();
  void Quote();
  void Scope();
  void If();
  void While();
  void For();
  void Else();
  void Print(bool endLine);
  void PrintPlain() { Print(false); }
  void PrintLine() { Print(true); }
  void Assert();
  void AssertFails();
  void FailDirective();
  void RunPython();
  void DefineSubstitution();
  void ParenExpression();
  void DoubleExpansion();

  // --- Definitions
  void Let();
  void Def() { DefineMacro(false, false, false); }
  void ExportDef() { DefineMacro(true, false, false); }
  void NakedDef() { DefineMacro(false, true, false); }
  void DefPython() { DefineMacro(false, false, true); }
  void DefineMacro(bool exported, bool naked, bool python);
  void ReadFormals(LSMacroVariable& macro);
  void AddMacro(std::unique_ptr<LSMacroVariable> macro, bool fileScope, bool exported);
  void AddValue(const TextRange& name, VarType type, std::string value);

  // --- Macro call
  struct BoundArgument {
    const MacroFormal* formal;
    TextRange text;
    bool isPlain;
  };
  void CallVariable(LSVariable& variable);
  void CallAndNote(LSVariable& variable);
  void CallMacro(const LSMacroVariable& macro);
  void CallFunctionArgument(const LSMacroVariable& macro);
  using BoundArguments = boost::container::small_vector<BoundArgument, 6>;
  BoundArguments ReadArguments(const LSMacroVariable& macro);
  void BindArgument(LSFrame& frame, const BoundArgument& argument, const LSMacroVariable& macro);
  void RunBody(const LSMacroVariable& macro, LSFrame& frame);
  void ExpandBody(const LSMacroVariable& macro, LSFrame& frame);
  void CopyBody(const LSMacroVariable& macro);

  // --- @for
  struct Loop;
  Loop ReadLoopHead();
  void RunLoop(const Loop& loop);
  std::string ListHint(const Loop& loop) const;
  void BindElement(const Loop& loop, const TextRange& element, LSFrame& frame);

  ImportHandler* const m_handler;
  LSFrame& m_frame;
  MacroWorld& m_world;
  ExpansionSink& m_sink;
  const int64_t m_stripIndent;
  LineIndent m_outIndent;
  const TextRange m_text;
  const TextRange* const m_anchor;
  const std::shared_ptr<const BodyWords> m_words;  // of the text, where they are known
  const bool m_hasLineFeeds;                       // the text; asked only where lines are indented
  size_t m_nextWord = 0;
  LexScanner m_scanner;
  TextRange m_tokenText;         // of the last token of the loop: generated output maps to it
  const char* m_here = nullptr;  // where that token begins
  const char* m_pendingBegin;
  const char* m_settled;
  bool m_isPlain = true;
};

// Whether nothing can be expanded in a text of such tokens alone, as long as no new name comes up.
inline bool IsPlainToken(const LexToken& token, const NamesInUse& names) {
  if (token.kind == kIdentifier) return !names.MayHold(token.text.View());
  if (token.kind >= kLess && token.kind < kAt) return true;  // operators and brackets
  switch (token.kind) {
    case kDoubleQuoted:
      return token.text.View().find("$(") == std::string_view::npos;
    case kRawString:  // its lines are not indented
    case kMacroComment:
    case kAt:
    case kBackquote:
    case kEndOfText:
      return false;
    default:
      return true;
  }
}

// Expansion into a string of its own; no map is kept.
std::string ExpandAside(LSFrame& frame, const TextRange& text, int64_t stripIndent, const TextRange* anchor);
std::string EvaluateAsText(LSFrame& frame, const TextRange& text, VarType type, const TextRange* anchor);

// A position in a text that is about to end must not survive it.
void ForgetPosition(LexScannerException& exception, const std::string& text);

// "message + token": the form of most failures of directives.
std::string WithToken(std::string_view message, const LexToken& token);

}  // namespace qrex
