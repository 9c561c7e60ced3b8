// The translator proper: scans the expanded text of one file, copies plain C++ through, and sends each `$` keyword to
// its handler. Handlers are free functions `void ParseX(QrexParser&)`, in the tables of file/keywords.cpp, which the
// parser is given; this class is what they share: tokens, copying, names, types, warnings.
//
// A handler is called with its keyword as the current token and leaves the current token on the last one of its
// declaration (the main loop reads on from there). It drops source text by moving the copy position forward without
// copying.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "macro/expression_parser.h"
#include "macro/source_map.h"
#include "text/streams.h"
#include "translator/reader/keywords.h"
#include "translator/reader/warnings.h"
#include "translator/symbols/name_space.h"
#include "translator/symbols/scanned_file.h"
#include "translator/symbols/type_predicates.h"
#include "translator/types/type_code.h"

namespace qrex {

class ClassDef;
class KeptOutput;
class LineDirectives;

// Receives the generated text, and keeps for each generated line the source position that it came from: that of the
// last source text copied, so that a compiler's error in generated text points at the declaration which produced it.
class QrexParserOutputStream : public IOutputStream {
 public:
  QrexParserOutputStream(IOutputStream& target, std::vector<const char*>& lineTable, TextRange expanded,
                         const SourceMap& map);
  // From here on the output goes through these, which are not owned and keep the line table.
  void Use(LineDirectives& directives) { m_directives = &directives; }
  void TellCopies(KeptOutput* kept) { m_kept = kept; }   // the target, if that wants to know; or null
  void Write(const void* data, size_t length) override;  // generated text
  void WriteIndented(std::string_view text, size_t blanks, bool atLineStart) override;
  void Flush() override;
  void CopyRange(const char* begin, const char* end);  // source text, bypassing the indentation
  const char* SourcePosition();                        // mapped position of the last source text copied; null if none
  const char* SourcePosition(const char* expanded) const;  // mapped position of an address in the expanded text
  std::string MarkOf(const char* expanded);                // of that address, see symbols/position_mark.h

 private:
  void AddLines(std::string_view text);  // of generated text to the line table
  IOutputStream& m_target;
  LineDirectives* m_directives = nullptr;
  KeptOutput* m_kept = nullptr;
  std::vector<const char*>& m_lineTable;
  TextRange m_expanded;
  const SourceMap& m_map;
  MapCursor m_cursor;
  const char* m_copied = nullptr;
};

enum class Naming { None, Optional, Required };  // may, or must, a name follow the type

struct ParsedType {
  TypeCode type;
  std::string name;               // empty: there is none
  bool followedByParen = false;   // a `(` follows the name
  const char* nameEnd = nullptr;  // in the expanded text: behind the name, or where it could be
  size_t suffixSize = 0;          // of the part of `type` that is the arrays behind the name
};

struct SignatureRules {
  bool constAllowed = false;  // behind the arguments
  bool directions = false;    // each argument begins with [in], [out], ...; a method returns nothing
  bool polymorphic = false;   // an argument may be in [ ]
  bool reflected = false;     // all types must be understood completely
};

struct ParsedMember {
  bool isAttribute = false;     // has no argument list
  FunctionSignature signature;  // of an attribute, its name and its type as returnType
};

class QrexParser : public ExpressionParser {
 public:
  QrexParser(ScannedFile& file, QrexParserOutputStream& stream, TextWriter& out, TextRange expanded,
             const KeywordTables& keywords);

  void Translate();  // the main loop over the whole text

  // --- Copying. The copy position is how far the expanded text has been dealt with, copied or dropped.
  void CopyTo(const char* position);
  void CopyToCurrent() { CopyTo(current.text.begin); }
  void DropTo(const char* position) { m_copyPosition = position; }
  void DropToCurrent() { DropTo(current.text.begin); }
  void DropBehindCurrent() { DropTo(current.text.end); }
  void Flush() { out.Flush(); }
  // Behind marked text that ends at the current token: what is generated next is on no line of that text.
  std::string EndMark() { return stream.MarkOf(current.text.begin); }

  // --- Tokens beyond ParserBase.
  bool Is(std::string_view word) const { return current.text == word; }
  bool Is(int32_t kind) const { return current.kind == kind; }
  bool Accept(int32_t kind);  // advances and answers true when the current token is of that kind
  bool AcceptWord(std::string_view word);
  std::string RequireIdentifier(std::string_view what = "identifier");  // advances
  [[noreturn]] void Fail(std::string message) const;                    // at the current token
  void CheckNesting(size_t levels) const;  // fails where declarations or name spaces are as deep as may be
  // From an opening bracket to its matching closing one, which becomes the current token. Failure: `atEnd`.
  void SkipToMatching(int32_t open, int32_t close, std::string_view atEnd);
  // The same for < >, where `>>` closes two levels.
  void SkipAngles(std::string_view atEnd = "Reached end of stream while scanning for matching >");
  void SplitShiftRight();  // a current `>>` becomes its first half; the second is the next token

  // --- Names.
  NameSpaceElement* FindName(std::string_view name);  // the current name space, then the root
  NameSpaceElement& ParseQualifiedId();
  void ParseExportModifier(NameSpaceElement& element);
  bool ParseExportModifier();                       // the bare `+`
  void ParseQualifiers(NameSpaceElement& element);  // << >> of functions, functors and interfaces; `<<` is current
  // As above for given flags; `onWhat` ends the failure text (" >> on $type"). `acceptOther` is asked about words that
  // are neither `reflect` nor `register`; false: the word is not known.
  void ParseQualifierFlags(bool& reflected, bool& registered, std::string_view onWhat,
                           const std::function<bool(bool on)>& acceptOther = nullptr);
  [[noreturn]] void FailConflict(std::string_view keyword, std::string_view name, const NameSpaceElement& old);
  [[noreturn]] void FailRepeated(const NameSpaceElement& old, const NameSpaceElement& element);
  // Into the current name space, or into the class that encloses it.
  void Enter(std::unique_ptr<NameSpaceElement> element, ClassDef* enclosing);
  // Enters a forward declaration into the current name space, also from a class body, unless its name is known there
  // already. `old` is what the look-up of one that is not nested found.
  void EnterForward(std::unique_ptr<NameSpaceElement> element, const NameSpaceElement* old, const ClassDef* enclosing);
  void RequireSemicolonAfter(const NameSpaceElement& element);  // "; expected after definition of ..."
  void SeeDeclaration(const NameSpaceElement& element);
  void RequireIObjectImport();  // "@import of IObject.h required"

  // --- Types (type_parser.cpp). `reflected`: the type must be understood completely. None: no type begins here.
  std::optional<ParsedType> ParseTypeWithName(Naming naming, bool reflected);
  FunctionSignature ParseFunctionSignature(const SignatureRules& rules);
  ParsedMember ParseMethodOrAttribute(const SignatureRules& rules);
  FunctionArg ParseFunctionArg(const SignatureRules& rules);
  std::string ReadArgumentText();                 // behind the current token, to the top-level `,` or `)` that ends it
  void ParseMetadataList(std::string& metadata);  // `[` is current; behind `]` afterwards
  void ParseMetadataValue(std::string& metadata);
  // The same, where the type or signature may be copied: text that compiles leaves `: [...]` out.
  void ParseMetadataBehindColon(std::string& metadata);

  // --- Warnings
  bool WarningOn(Warning warning) const { return warnings.On(warning); }
  // Position: `address` in the expanded text, else the element's, else where the scanner reads.
  void ReportWarning(Warning warning, std::string_view text, const NameSpaceElement* element = nullptr,
                     const char* address = nullptr);
  // That the text of a declaration can't compile; says what to write instead. Only where text that compiles is wanted.
  void WarnOfText(std::string_view text, const NameSpaceElement& element, const char* address = nullptr);
  bool WantsCompilableText() const { return file.host.Settings().compilableText; }
  void CheckPublicHeader(const NameSpaceElement& element);       // both of the following
  void CheckNotExported(const NameSpaceElement& element);        // in one
  void CheckNotInPublicHeader(const NameSpaceElement& element);  // outside of one
  void CheckReferences(const NameSpaceElement& element);         // to what is not registered
  void CheckMetadata(const NameSpaceElement& element);           // of what is not reflected
  void CheckRedundant(const NameSpaceElement& element);          // non-reflected with a list that needs it

  const char* SourcePosition() {
    out.Flush();
    return stream.SourcePosition();
  }  // where the next declaration begins
  NameSpace& Current() { return *m_nameSpaces.back(); }
  NameSpace& Root() { return *m_nameSpaces.front(); }
  bool AtFileScope() const { return m_nameSpaces.size() == 1; }
  const Project& GetProject() const { return *file.file.project; }
  const KeywordTables& Keywords() const { return m_keywords; }

  Warnings warnings;
  int nesting = 0;           // of declarations inside declarations, see NestingGuard
  bool inCodeBlock = false;  // what is declared is local to a function
  ScannedFile& file;
  QrexParserOutputStream& stream;
  TextWriter& out;
  const TextRange expanded;

 private:
  void CheckInclude();
  bool TranslateAt();
  // --- name_spaces.cpp
  struct NameSpaceHead {
    std::vector<LexToken> names;  // one for each level; none of an unnamed one
    LexToken brace;
  };
  void OpenNameSpace();
  void OpenCppNameSpace();
  std::optional<NameSpaceHead> ReadNameSpaceHead();
  bool SkipBrackets(int32_t open, int32_t close);
  bool StandsInDirective(const char* position);
  void EnterNameSpace(const std::string& name, const char* position);
  void CloseBrace();
  void Dispatch();
  std::optional<TypeCode> ParseBaseType(bool reflected);
  std::optional<TypeCode> ParseDecoratorType(bool reflected);
  std::optional<TypeCode> ParseSuffixedType(bool reflected);
  TypeCode ParseInnerType(bool reflected);
  void CheckPlatformDependent() const;
  [[noreturn]] void FailUnknown() const;
  TypeCode ParseArraySuffix();
  std::vector<FunctionArg> ParseArguments(const SignatureRules& rules);
  void ParseSignatureEnd(FunctionSignature& signature, const SignatureRules& rules);
  size_t ParseMetadataValues(std::string& metadata, int32_t close, std::string_view expected,
                             std::string_view exceeded);

  const KeywordTables& m_keywords;
  const char* m_copyPosition;
  std::vector<TextRange> m_uncopied;     // what is left out of the text that is copied next, in its order
  std::vector<NameSpace*> m_nameSpaces;  // the root first, the current one last
  struct OuterDepth {
    int64_t braces;
    size_t nameSpaces;  // how many are open there
  };
  std::vector<OuterDepth> m_savedDepths;  // of the definitions of name spaces that are open
  int64_t m_braceDepth = 0;
  const char* m_lineAsked;         // see StandsInDirective
  bool m_lineIsDirective = false;  // of the line on which that is
};

// Bounds the recursion of handlers that call each other for nested declarations, types or lists.
class NestingGuard {
 public:
  explicit NestingGuard(QrexParser& parser) : m_parser(parser) {
    parser.CheckNesting(static_cast<size_t>(parser.nesting));
    ++parser.nesting;
  }
  ~NestingGuard() { --m_parser.nesting; }
  NestingGuard(const NestingGuard&) = delete;
  NestingGuard& operator=(const NestingGuard&) = delete;

 private:
  QrexParser& m_parser;
};

// Handlers that other kinds call inside their bodies.
void ParseNew(QrexParser& parser);
void SkipNewExpression(QrexParser& parser);  // from `new` to behind the expression
inline constexpr std::string_view kDollarNew = "vesk::DollarNew(new";
inline constexpr std::string_view kDollarThis = "this->GetThisAsFinalClass()";
void ParseInit(QrexParser& parser);
void ParseUninit(QrexParser& parser);
void ParseWarning(QrexParser& parser);

}  // namespace qrex
