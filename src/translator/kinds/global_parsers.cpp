#include "translator/kinds/global_parsers.h"

#include "translator/emit/emit.h"
#include "translator/kinds/global_defs.h"
#include "translator/kinds/polymorphic.h"
#include "translator/reader/qrex_parser.h"
#include "translator/symbols/type_predicates.h"

namespace qrex {

// --- $function

namespace {

std::string SignatureText(const FunctionSignature& signature) {
  MemoryTextWriter text;
  WriteSignature(text, signature);
  return text.TakeText();
}

bool SameSignature(const GlobalFunctionDef& a, const GlobalFunctionDef& b) {
  NameSpace& rootA = *a.owner.rootNameSpace;
  NameSpace& rootB = *b.owner.rootNameSpace;
  const auto& argumentsA = a.m_signature.arguments;
  const auto& argumentsB = b.m_signature.arguments;
  if (argumentsA.size() != argumentsB.size()) return false;
  for (size_t i = 0; i < argumentsA.size(); ++i) {
    if (!SameType(argumentsA[i].type, rootA, argumentsB[i].type, rootB)) return false;
  }
  return SameType(a.m_signature.returnType, rootA, b.m_signature.returnType, rootB);
}

void CopyFunctionBody(QrexParser& parser, const std::string& name, const char* statement) {
  parser.DropTo(parser.previous.text.end);
  parser.Expect(kOpenBrace, "{");
  for (int64_t depth = 1;;) {
    if (parser.Is(kEndOfText)) {
      throw LexScannerException("Met EOF while scanning body of function " + name, statement);
    }
    if (parser.Is(kOpenBrace)) ++depth;
    if (parser.Is(kCloseBrace) && --depth == 0) break;
    if (parser.Is(kDollar)) {
      LexScanner ahead = parser.scanner;
      if (NextToken(ahead).Is("new")) {
        parser.CopyToCurrent();
        parser.Advance();
        ParseNew(parser);
        continue;
      }
    }
    parser.Advance();
  }
  parser.CopyTo(parser.current.text.end);
}

void CheckFunctionDefinition(QrexParser& parser, const GlobalFunctionDef& def, const GlobalFunctionDef* old) {
  if (old && old->status == DeclStatus::Defined) parser.FailRepeated(*old, def);
  const bool isInline = def.m_signature.isInline;
  if (parser.file.file.kind == FileKind::H && !isInline) {
    parser.ReportWarning(Warning::NotInlineInHeader,
                         PrintedElement(def) + " is defined in a header file and isn't inlined", &def);
  }
  if (IsLibrary(parser.GetProject().targetType) && !isInline && !old) {
    parser.ReportWarning(Warning::UndeclaredInLibrary,
                         PrintedElement(def) + " defined in library without prior declaration", &def);
  }
}

}  // namespace

void ParseGlobalFunction(QrexParser& parser, bool polymorphic) {
  parser.Advance();
  auto made = std::make_unique<GlobalFunctionDef>(parser.file, parser.SourcePosition());
  GlobalFunctionDef& def = *made;
  parser.ParseExportModifier(def);
  const char* const statement = parser.current.text.begin;
  if (parser.Is(kShiftLeft)) parser.ParseQualifiers(def);
  def.m_signature = parser.ParseFunctionSignature({.polymorphic = polymorphic, .reflected = def.m_reflected});
  def.name = def.m_signature.name;
  def.metadata = def.m_signature.metadata;
  def.parent = &parser.Current();
  parser.CheckNotExported(def);
  GlobalFunctionDef* old = nullptr;
  if (NameSpaceElement* found = parser.Current().Lookup(def.name)) {
    if (found->category != Category::GlobalFunction) parser.FailConflict("function", def.name, *found);
    old = static_cast<GlobalFunctionDef*>(found);
  }
  parser.Current().Add(std::move(made));
  if (!def.m_signature.isInline) parser.out << ExportPrefix(def);
  WriteSignature(parser.out, def.m_signature);
  if (old && parser.WarningOn(Warning::InconsistentSignatures) && !SameSignature(def, *old)) {
    parser.ReportWarning(Warning::InconsistentSignatures,
                         PrintedElement(def) + " declarations have inconsistent signatures :\n    " +
                             SignatureText(def.m_signature) + "\n    " + SignatureText(old->m_signature) + "\n",
                         &def);
    parser.SeeDeclaration(*old);
  }
  if (parser.Is(kSemicolon)) {
    parser.CheckNotInPublicHeader(def);
    if (def.ContainsMetaData()) {
      parser.ReportWarning(Warning::MetadataOfForward,
                           "Forward declaration of " + PrintedElement(def) + " contains metadata", &def);
    }
    parser.DropBehindCurrent();
    if (polymorphic) {
      parser.out << "\n";
      WriteDispatchBody(parser, def);
      def.status = DeclStatus::Defined;
    } else {
      parser.out << ";";
    }
    parser.Flush();
    return;
  }
  if (polymorphic) {
    parser.Fail("; expected after definition of " + PrintedElement(def) + " when read " + Printed(parser.current));
  }
  CheckFunctionDefinition(parser, def, old);
  def.status = DeclStatus::Defined;
  parser.CheckReferences(def);
  parser.CheckMetadata(def);
  CopyFunctionBody(parser, def.name, statement);
}

// --- $var, $typedef

namespace {

// What `+` and the qualifier list say, ahead of the element itself.
struct DeclaredFlags {
  bool exported = false, reflected = false, registered = false, isExtern = false;

  void Read(QrexParser& parser, bool externAllowed) {
    parser.RequireIObjectImport();
    parser.Advance();
    exported = reflected = registered = parser.ParseExportModifier();
    if (!parser.Is(kShiftLeft)) return;
    parser.ParseQualifierFlags(reflected, registered, " >> on $typedef", [&](bool on) {
      if (!externAllowed || !parser.Is("extern")) return false;
      isExtern = on;
      return true;
    });
  }

  void Set(NameSpaceElement& element) const {
    element.m_exported = element.m_strict = exported;
    element.m_reflected = reflected;
    element.m_registered = registered;
  }
};

// To the `;`, so that array suffixes and initialisers are copied.
void CopyToSemicolon(QrexParser& parser, const std::string& atEnd, const char* position) {
  while (!parser.Is(kSemicolon)) {
    if (parser.Is(kEndOfText)) throw LexScannerException(atEnd, position);
    parser.Advance();
  }
  parser.CopyTo(parser.current.text.end);
}

// Type and name of a $var or $typedef.
struct Declaration {
  const char* begin;  // of the type
  ParsedType parsed;

  Declaration(QrexParser& parser, bool reflected, std::string_view what) : begin(parser.current.text.begin) {
    std::optional<ParsedType> found = parser.ParseTypeWithName(Naming::Required, reflected);
    if (!found) parser.Fail(std::string(what) + " expected when read " + Printed(parser.current));
    parsed = std::move(*found);
  }

  // "T name" without the array suffixes: the source's own are copied.
  void WriteTo(QrexParser& parser, std::string_view prefix) const {
    WriteTo(parser, prefix, std::string_view(parsed.type).substr(parsed.suffixSize));
    parser.DropTo(parsed.nameEnd);
  }
  // Arrays as what fields of the type are.
  void WriteWholeTo(QrexParser& parser, std::string_view prefix) const {
    WriteTo(parser, prefix, parsed.type);
    parser.DropTo(parser.previous.text.end);
  }

 private:
  void WriteTo(QrexParser& parser, std::string_view prefix, TypeView type) const {
    parser.out << prefix << TypeText(type) << " " << parsed.name;
    parser.Flush();
  }
};

template <typename Def>
Def& AddDeclared(QrexParser& parser, const DeclaredFlags& flags, const Declaration& declaration,
                 std::string_view keyword) {
  if (NameSpaceElement* found = parser.Current().Lookup(declaration.parsed.name)) {
    parser.FailConflict(keyword, declaration.parsed.name, *found);
  }
  auto made = std::make_unique<Def>(parser.file, parser.SourcePosition());
  Def& def = *made;
  def.name = declaration.parsed.name;
  def.m_type = declaration.parsed.type;
  flags.Set(def);
  parser.Current().Add(std::move(made));
  return def;
}

}  // namespace

void ParseGlobalVar(QrexParser& parser) {
  DeclaredFlags flags;
  flags.Read(parser, false);
  const Declaration declaration(parser, flags.reflected, "Variable declaration");
  parser.CheckNotExported(AddDeclared<GlobalVarDef>(parser, flags, declaration, "var"));
  declaration.WriteTo(parser, "");
  CopyToSemicolon(parser, "Missing semicolon after definition of variable " + declaration.parsed.name,
                  declaration.begin);
}

void ParseTypedef(QrexParser& parser) {
  DeclaredFlags flags;
  flags.Read(parser, true);
  const Declaration declaration(parser, flags.reflected, "Type");
  const auto& def = AddDeclared<TypedefDef>(parser, flags, declaration, "typedef");
  parser.CheckPublicHeader(def);
  if (flags.isExtern) {
    parser.DropTo(declaration.parsed.nameEnd);
  } else if (def.WantsCompilableText()) {  // a model could not have fields of a bare array
    declaration.WriteWholeTo(parser, "typedef ");
  } else {
    declaration.WriteTo(parser, "typedef ");
  }
  parser.CheckMetadata(def);
  CopyToSemicolon(parser, "Missing semicolon after typedef " + declaration.parsed.name, declaration.begin);
  Write(parser.out, R"(

    inline vesk::ConstStringZ GetTypedefName_$name$()
    {
        return "$qualifiedName$";
    }
  )",
        "name"_ = def.name, "qualifiedName"_ = def.GetQualifiedName());
  parser.Flush();
}

}  // namespace qrex
