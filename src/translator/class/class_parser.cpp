// The statement around a class: heading words, declarations of each status, what is written around the body.

#include "translator/class/class_parser.h"

#include "translator/class/class_body.h"
#include "translator/class/class_emission.h"
#include "translator/class/class_head.h"
#include "translator/class/mixin_list.h"
#include "translator/class/text_checks.h"
#include "translator/emit/emit.h"
#include "translator/emit/records.h"
#include "translator/interface/interface_def.h"
#include "translator/model/model.h"
#include "translator/reader/qrex_parser.h"
#include "translator/reader/qualifiers.h"

namespace qrex {

namespace {

// Parses one statement; the members are its intermediate results.
class ClassStatement {
 public:
  ClassStatement(QrexParser& parser, ClassKind kind, ClassDef* enclosing)
      : m_parser(parser), m_out(parser.out), m_kind(kind), m_enclosing(enclosing) {}
  void Parse();

 private:
  bool IsNested() const { return m_enclosing != nullptr; }
  bool OldHasStatus(DeclStatus status) const { return m_old && m_old->GetDeclStatus() == status; }
  void ReadHeading();
  void CheckImplement();
  void MakeElement();
  void ReadTemplateArguments();
  void ParseForward();
  void ParseModel();
  void ParseAdt();
  void ParseInterfaces();
  void CheckGeneratedOps();
  void ParseDeferred();
  void ParseDefinition();
  bool ArchivesInPlace() const;
  void Finish();

  QrexParser& m_parser;
  TextWriter& m_out;
  const ClassKind m_kind;
  ClassDef* const m_enclosing;
  std::string m_name;
  bool m_exported = false;
  bool m_implement = false;
  bool m_final = false;
  bool m_redundant = false;
  bool m_traitsWritten = false;
  ClassDef* m_old = nullptr;  // the earlier declaration in view
  std::unique_ptr<ClassDef> m_made;
  ClassDef* m_def = nullptr;
};

void ClassStatement::ReadHeading() {
  m_parser.RequireIObjectImport();
  m_parser.Advance();
  m_exported = m_parser.ParseExportModifier();
  if (m_exported && m_kind == ClassKind::Mixin) m_parser.Fail("'+' modifier not permitted on $mixin");
  if (m_exported && IsNested()) m_parser.Fail("'+' modifier not permitted on nested classes or structs");
  if (m_parser.Is("implement")) {
    if (m_kind != ClassKind::Adt) m_parser.Fail("'implement' modifier only permitted on $adt");
    m_implement = true;
    m_parser.Advance();
  }
  m_name = m_parser.RequireIdentifier();
  m_final = m_parser.AcceptWord("final");
}

void ClassStatement::CheckImplement() {
  if (!IsNested()) {
    NameSpaceElement* found = m_parser.Current().Lookup(m_name);
    if (found) {
      m_old = found->category == Category::Class ? static_cast<ClassDef*>(found) : nullptr;
      if (!m_old || m_old->m_kind != m_kind) m_parser.FailConflict(KeywordOf(m_kind), m_name, *found);
    }
  }
  if (!m_implement) return;
  if (!m_old) m_parser.Fail("Can't implement undefined $adt " + m_name);
  if (OldHasStatus(DeclStatus::Deferred)) return;
  m_parser.SeeDeclaration(*m_old);
  if (OldHasStatus(DeclStatus::Defined)) m_parser.Fail("Repeated implementation of " + PrintedElement(*m_old));
  m_parser.Fail("Can't implement undefined $adt " + m_name);
}

void ClassStatement::MakeElement() {
  m_made = std::make_unique<ClassDef>(m_parser.file, m_parser.SourcePosition(), m_kind);
  m_def = m_made.get();
  m_def->name = m_name;
  m_def->parent = &m_parser.Current();
  m_def->m_nested = IsNested();
  m_def->m_enclosing = m_enclosing;
  m_def->SetExported(m_exported);
  if (m_implement) m_def->m_methods = m_old->m_methods;
  if (m_parser.Is(kLess)) ReadTemplateArguments();
}

// The current token is `<`, afterwards the one behind the matching `>`.
void ClassStatement::ReadTemplateArguments() {
  const char* begin = m_parser.current.text.end;
  std::string names;
  auto takeName = [&](std::string_view where) {
    if (m_parser.previous.kind != kIdentifier) {
      m_parser.Fail("Expected identifier before " + std::string(where) + " when read " + Printed(m_parser.previous));
    }
    names += m_parser.previous.text.View();
  };
  for (int64_t depth = 0;; m_parser.Advance()) {
    if (m_parser.Is(kEndOfText)) m_parser.Fail("Met EOS before read matching angled bracket");
    if (m_parser.Is(kLess)) ++depth;
    if (m_parser.Is(kGreater) && --depth == 0) break;
    if (m_parser.Is(kComma) && depth == 1) {
      takeName("comma");
      names += ",";
    }
  }
  takeName(">");
  m_def->m_templateArgList = std::string(begin, m_parser.current.text.begin);
  m_def->m_templateArgNames = std::move(names);
  m_parser.Advance();
}

void ClassStatement::ParseForward() {
  if (m_implement) {
    m_parser.Fail("Forward declaration of " + PrintedElement(*m_def) + " incompatible with 'implements'");
  }
  if (m_exported)
    m_parser.ReportWarning(Warning::DeprecatedExport, "+ on forward declaration of " + m_name + " deprecated");
  WriteForwardDeclaration(m_out, *m_def);
  m_def->status = DeclStatus::Forward;
  m_parser.EnterForward(std::move(m_made), m_old, m_enclosing);
  m_parser.Flush();
  m_parser.DropBehindCurrent();
}

void ClassStatement::ParseModel() {
  m_def->status = DeclStatus::Defined;
  ParseModelStruct(m_parser, *m_def);
  m_parser.Advance();
  m_parser.RequireSemicolonAfter(*m_def);
  WriteReflectionDeclarations(m_out, *m_def);
  WriteModelMixin(m_out, *m_def);
}

void ClassStatement::ParseAdt() {
  if (OldHasStatus(DeclStatus::Deferred)) m_parser.FailRepeated(*m_old, *m_def);
  WriteForwardDeclaration(m_out, *m_def);
  m_parser.Flush();
  m_def->status = DeclStatus::Deferred;
  if (!m_parser.Is(kOpenBrace)) m_parser.FailExpected("{");
  ParseAdtBody(m_parser, *m_def);
  m_parser.Advance();
  m_parser.RequireSemicolonAfter(*m_def);
}

void ClassStatement::ParseInterfaces() {
  if (m_parser.Is("isa")) {
    if (m_def->IsMixin()) m_parser.Fail("'isa' prohibited on a $mixin");
    m_parser.Advance();
    ParseIsaList(m_parser, *m_def);
  }
  for (const InterfaceDef* interface : m_def->m_interfaces) {
    m_def->m_implementsIPersistable |= interface->InheritsFrom("vesk::IPersistable");
    m_def->m_implementsIObject |= interface->InheritsFrom("vesk::IObject");
  }
  if (m_def->m_implementsIPersistable) {
    m_def->m_reflected = m_def->m_registered = m_def->m_strict = true;
    if (m_def->m_qualifiers.abstract == TriState::On || m_def->m_qualifiers.dc == TriState::Off) {
      m_parser.Fail("IPersistable classes must have a default constructor");
    }
  }
  if (m_redundant) m_parser.CheckRedundant(*m_def);
}

void ClassStatement::CheckGeneratedOps() {
  if (m_def->m_implementsIObject && m_def->m_inheritsModel) m_def->m_reflected = true;
  if (m_def->IsMixin()) return;
  bool genop = m_def->m_qualifiers.genop == TriState::On;
  if (m_def->m_referencedModel) genop |= m_def->m_referencedModel->m_qualifiers.genop == TriState::On;
  for (const ClassDef* mixin : m_def->m_mixins) genop |= mixin->m_qualifiers.genop == TriState::On;
  if (!genop) return;
  if (!m_def->m_reflected) {
    m_def->m_reflected = true;
    m_def->m_strict = false;
  }
  if (!m_def->m_implementsIObject) {
    m_parser.Fail("Class " + PrintedElement(*m_def) + " needs to generate ops but doesn't implement IObject");
  }
}

// Whether a model may come whose archive functions are in the class: one of a template or mixin, of an entry of a
// mixin list, or of a class inside of this one. What they call must be declared ahead of the outermost class.
bool ClassStatement::ArchivesInPlace() const {
  if (IsNested() || !m_def->WantsCompilableText()) return false;
  int64_t depth = 0;
  LexToken token = m_parser.current, previous;
  for (LexScanner ahead = m_parser.scanner; token.kind != kEndOfText; previous = token, token = NextToken(ahead)) {
    if (token.kind == kOpenBrace || token.kind == kOpenBracket) ++depth;
    if (token.kind == kCloseBrace || token.kind == kCloseBracket) --depth;
    if (token.kind == kSemicolon && depth == 0) return false;
    if (!token.Is("model")) continue;
    const bool isOwn = depth == 0 || (depth == 1 && previous.kind == kDollar);
    if (!isOwn || m_def->MemberPlacement() == Placement::InClass) return true;
  }
  return false;
}

void ClassStatement::ParseDeferred() {
  if (m_implement) {
    m_parser.Fail("Forward declaration of " + PrintedElement(*m_def) + " incompatible with 'implements'");
  }
  if (!m_def->ExternalDefinition()) m_out << ";\n";
  if (OldHasStatus(DeclStatus::Deferred)) {
    m_parser.SeeDeclaration(*m_old);
    m_parser.Fail(PrintedElement(*m_def) + " already deferred");
  }
  m_def->status = DeclStatus::Deferred;
  WriteReflectionDeclarations(m_out, *m_def);
  m_parser.Flush();
}

void ClassStatement::ParseDefinition() {
  if (!m_parser.Is(kOpenBrace)) m_parser.FailExpected("{");
  const bool isExternal = m_def->ExternalDefinition();
  m_parser.DropToCurrent();  // so that the source's own brace is copied
  if (!isExternal) {
    m_out << "\n";
    m_parser.Flush();
    if (!m_def->m_mixinBaseClass.empty()) {
      Write(m_out, R"(
        {
        $public$
            typedef $base$ BaseClass;
      )",
            "public"_ = If(m_def->m_kind == ClassKind::Class, "public:"), "base"_ = m_def->m_mixinBaseClass);
      m_parser.DropBehindCurrent();
    }
  }
  ParseClassBody(m_parser, *m_def);
  if (isExternal) {
    m_parser.DropToCurrent();
  } else {
    m_parser.CopyToCurrent();
    m_out << "\n";
    WriteClassMembers(m_out, *m_def);
  }
  m_parser.Advance();
  m_parser.RequireSemicolonAfter(*m_def);
  if (isExternal) return;
  m_out << "};\n";
  if (!m_old || OldHasStatus(DeclStatus::Forward)) {
    m_out << "\n";
    WriteReflectionDeclarations(m_out, *m_def);
  }
}

void ClassStatement::Finish() {
  m_parser.Flush();
  WriteClassOperators(m_out, *m_def);
  const DeclStatus complete = m_def->IsAdt() ? DeclStatus::Deferred : DeclStatus::Defined;
  if (!m_traitsWritten && !m_def->IsMixin() && m_def->status == complete && m_def->WriteTraits()) {
    WriteTypeTraits(m_out, *m_def);
  }
  m_parser.Flush();
  m_parser.CheckReferences(*m_def);
  m_parser.CheckMetadata(*m_def);
  CheckTextOfClass(m_parser, *m_def);
  m_parser.DropBehindCurrent();
}

void ClassStatement::Parse() {
  ReadHeading();
  CheckImplement();
  MakeElement();
  if (m_parser.Is(kSemicolon)) return ParseForward();
  m_parser.Enter(std::move(m_made), m_enclosing);
  if (!m_def->IsMixin() && !m_implement) m_parser.CheckPublicHeader(*m_def);
  if (OldHasStatus(DeclStatus::Defined)) m_parser.FailRepeated(*m_old, *m_def);
  if (m_parser.Accept(kShiftLeft)) m_redundant = ParseQualifierList(m_parser, *m_def);
  const bool isPlainAdt = m_def->IsAdt() && !m_implement;
  if ((m_def->IsPureModel() || isPlainAdt) && m_parser.Accept(kColon)) {
    if (!m_parser.Is(kOpenBracket)) m_parser.FailExpected("[");
    m_parser.ParseMetadataList(m_def->metadata);
  }
  if (m_def->IsPureModel()) {
    ParseModel();
  } else if (isPlainAdt) {
    ParseAdt();
  } else {
    ParseInterfaces();
    if (ArchivesInPlace()) {
      WriteOutsideNameSpaces(m_out, m_def->parent, [&] { WriteTargetDeclarations(m_out, *m_def); });
    }
    m_traitsWritten = ParseClassHead(m_parser, *m_def, m_final);
    CheckGeneratedOps();
    if (m_parser.Is(kSemicolon)) {
      ParseDeferred();
    } else {
      ParseDefinition();
    }
  }
  Finish();
}

}  // namespace

void ParseClass(QrexParser& parser, ClassKind kind, ClassDef* enclosing) {
  NestingGuard guard(parser);
  ClassStatement(parser, kind, enclosing).Parse();
}

}  // namespace qrex
