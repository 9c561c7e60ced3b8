#include "translator/kinds/enum_parser.h"

#include "translator/emit/records.h"
#include "translator/kinds/enum_def.h"
#include "translator/kinds/enum_emission.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

class EnumStatement {
 public:
  EnumStatement(QrexParser& parser, ClassDef* enclosing) : m_parser(parser), m_enclosing(enclosing) {}
  void Parse();

 private:
  void ReadHeading();
  void ParseForward();
  void ReadQualifiers();
  void ReadEntries();
  void ReadEntry();
  void FillValues(size_t count);

  QrexParser& m_parser;
  ClassDef* const m_enclosing;
  bool m_exported = false;
  bool m_hasDefault = false;
  EnumDef* m_old = nullptr;
  std::unique_ptr<EnumDef> m_made;
  EnumDef* m_def = nullptr;
};

void EnumStatement::ReadHeading() {
  m_parser.Advance();
  m_exported = m_parser.ParseExportModifier();
  if (m_exported && m_enclosing) m_parser.Fail("'+' modifier not permitted on nested enum");
  const bool isClass = m_parser.AcceptWord("class");
  const std::string name = m_parser.RequireIdentifier();
  if (!m_enclosing) {
    if (NameSpaceElement* found = m_parser.Current().Lookup(name)) {
      if (found->category != Category::Enum) m_parser.FailConflict("enum", name, *found);
      m_old = static_cast<EnumDef*>(found);
      if (m_old->m_isClass != isClass) {
        m_parser.SeeDeclaration(*m_old);
        m_parser.Fail(PrintedElement(*m_old) + (m_old->m_isClass ? " had" : " didn't have") +
                      " 'class' modifier in an earlier declaration");
      }
    }
  }
  m_made = std::make_unique<EnumDef>(m_parser.file, m_parser.SourcePosition());
  m_def = m_made.get();
  m_def->name = name;
  m_def->parent = &m_parser.Current();
  m_def->m_isClass = isClass;
  m_def->m_nested = m_enclosing != nullptr;
  m_def->SetExported(m_exported);
}

void EnumStatement::ParseForward() {
  if (m_exported)
    m_parser.ReportWarning(Warning::DeprecatedExport, "+ on forward declaration of " + m_def->name + " deprecated");
  if (m_def->m_isClass) {
    m_parser.out << "class " << m_def->name << ";\n";
  } else {
    m_parser.out << "enum " << m_def->name << " : int;\n";
  }
  m_parser.EnterForward(std::move(m_made), m_old, m_enclosing);
  m_parser.Flush();
  m_parser.DropBehindCurrent();
}

void EnumStatement::ReadQualifiers() {
  m_parser.ParseQualifierFlags(m_def->m_reflected, m_def->m_registered, " >> on " + PrintedElement(*m_def),
                               [this](bool on) {
                                 if (!m_parser.Is("extern")) return false;
                                 m_def->m_extern = on ? TriState::On : TriState::Off;
                                 return true;
                               });
}

void EnumStatement::FillValues(size_t count) {
  std::vector<int64_t>& values = m_def->m_values;
  while (values.size() < count) values.push_back(values.empty() ? 0 : values.back() + 1);
}

void EnumStatement::ReadEntry() {
  if (m_parser.Is("default")) {
    if (!m_def->m_isClass) m_parser.Fail("Default specifier only supported on $enum class");
    if (m_hasDefault) m_parser.Fail("Repeated default specifier in " + PrintedElement(*m_def));
    m_hasDefault = true;
    m_def->m_defaultIndex = m_def->m_labels.size();
    m_parser.Advance();
  }
  const bool enabled = !m_parser.Accept(kMinus);
  m_def->m_labels.push_back(m_parser.RequireIdentifier());
  m_def->m_enabled.push_back(enabled);
  if (!m_parser.Accept(kAssign)) return;
  const int64_t value = static_cast<int32_t>(m_parser.ReadInt64());
  FillValues(m_def->m_labels.size() - 1);
  m_def->m_values.push_back(value);
}

void EnumStatement::ReadEntries() {
  while (!m_parser.Is(kCloseBrace)) {
    ReadEntry();
    if (m_parser.Is(kCloseBrace)) break;
    if (!m_parser.Accept(kComma)) m_parser.FailExpected(", or }");
  }
  if (!m_def->m_values.empty()) FillValues(m_def->m_labels.size());
}

void EnumStatement::Parse() {
  ReadHeading();
  if (m_parser.Is(kSemicolon)) return ParseForward();
  m_def->status = DeclStatus::Defined;
  m_parser.Enter(std::move(m_made), m_enclosing);
  m_parser.CheckPublicHeader(*m_def);
  if (m_old && m_old->status == DeclStatus::Defined) m_parser.FailRepeated(*m_old, *m_def);
  if (m_parser.Is(kShiftLeft)) ReadQualifiers();
  if (m_parser.Accept(kColon)) m_parser.ParseMetadataList(m_def->metadata);
  m_parser.Expect(kOpenBrace, "{");
  ReadEntries();
  WriteEnumText(m_parser.out, *m_def);
  WriteEnumSerialise(m_parser.out, *m_def);
  if (!m_def->m_nested) WriteTypeTraits(m_parser.out, *m_def);
  m_parser.Flush();
  m_parser.CheckMetadata(*m_def);
  m_parser.Advance();
  m_parser.RequireSemicolonAfter(*m_def);
  m_parser.DropBehindCurrent();
}

}  // namespace

void ParseEnum(QrexParser& parser, ClassDef* enclosing) { EnumStatement(parser, enclosing).Parse(); }

}  // namespace qrex
