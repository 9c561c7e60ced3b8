#include "translator/kinds/enum_def.h"

#include <algorithm>

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/emit/records.h"

namespace qrex {

bool EnumDef::HasDisabledLabel() const {
  return std::find(m_enabled.begin(), m_enabled.end(), false) != m_enabled.end();
}

namespace {

// --- Text

void WriteLabelRows(TextWriter& out, const EnumDef& def) {
  for (const std::string& label : def.m_labels) out << "\"" << label << "\",\n";
}

void WriteValueRows(TextWriter& out, const EnumDef& def) {
  for (int64_t value : def.m_values) out << value << ",\n";
}

void WriteEnabledRows(TextWriter& out, const EnumDef& def) {
  for (bool enabled : def.m_enabled) out << BoolText(enabled) << ",\n";
}

using WriteRows = void (*)(TextWriter& out, const EnumDef& def);

// static TYPE NAME[] = rows, as a table of the record or inside a function that answers it.
void WriteTable(TextWriter& out, const EnumDef& def, std::string_view type, std::string_view name,
                std::string_view assign, WriteRows writeRows) {
  out << "static " << type << " " << name << "[] =" << assign << "\n";
  Block rows(out, ";");
  writeRows(out, def);
}

void WriteTableFunction(TextWriter& out, const EnumDef& def, std::string_view heading, std::string_view type,
                        WriteRows writeRows) {
  out << heading << "()\n";
  Block body(out);
  WriteTable(out, def, type, "_s", " ", writeRows);
  out << "return _s;\n";
}

void WriteEnumeration(TextWriter& out, const EnumDef& def, std::string_view name) {
  out << "enum " << name << " : int\n";
  Block body(out, ";");
  for (size_t i = 0; i < def.m_labels.size(); ++i) {
    out << def.m_labels[i];
    if (!def.m_values.empty()) out << "=" << def.m_values[i];
    out << (i + 1 < def.m_labels.size() ? ",\n" : "\n");
  }
}

void WriteEnumClass(TextWriter& out, const EnumDef& def) {
  const std::string& name = def.name;
  const std::string base = def.m_values.empty() ? "EnumBase" : "EnumBaseForRefinedLabels";
  const int64_t defaultValue =
      def.m_values.empty() ? static_cast<int64_t>(def.m_defaultIndex) : def.m_values[def.m_defaultIndex];
  out << "class " << name << " : public vesk::" << base << "<" << name << ">\n";
  Block body(out, ";");
  out << "public:\n";
  WriteEnumeration(out, def, "Enum");
  WriteText(out, "$0(Enum _v) : $1(_v) {}\nexplicit $0(int _v = $2) : $1(_v) {}\n",
            {name, base, std::to_string(defaultValue)});
  out << "enum { LEN = " << def.m_labels.size() << " };\n";
  WriteTableFunction(out, def, "static vesk::ConstStringZ const * stringArray", "vesk::ConstStringZ const",
                     WriteLabelRows);
  if (!def.m_values.empty()) {
    WriteTableFunction(out, def, "static const vesk::int32* valueArray", "const vesk::int32", WriteValueRows);
  }
  if (def.HasDisabledLabel()) {
    WriteTableFunction(out, def, "static const bool* enabledArray", "const bool", WriteEnabledRows);
  }
}

void WriteEnumText(TextWriter& out, const EnumDef& def) {
  if (def.m_extern != TriState::On) {
    if (def.m_isClass) {
      WriteEnumClass(out, def);
    } else {
      WriteEnumeration(out, def, def.name);
    }
  }
  if (!def.m_reflected) return;
  out << ExportPrefix(def) << "vesk::ReflectedEnum const& _GetReflected(" << def.name << " const*);\n";
  out << "inline vesk::TypeOps const& _GetTypeOps(" << def.name
      << " const*) { return vesk::GetTypeOps<vesk::int32>(); }\n";
}

void WriteEnumSerialise(TextWriter& out, const EnumDef& def) {
  if (def.m_isClass) return;
  WriteText(out,
            "template<typename Archive> inline void Serialise(Archive& _ar,$0 _x) "
            "{ vesk::SerialiseVariableLengthUint(_ar, (int)_x); }\n"
            "template<typename Archive> inline void Deserialise(Archive& _ar,$0& _x) "
            "{ vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }\n",
            {def.name});
}

// --- Reading

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
  if (m_exported) m_parser.ReportWarning(1017, "+ on forward declaration of " + m_def->name + " deprecated");
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

void EnumDef::WriteReflectedDefinition(TextWriter& out) {
  out << ExportPrefix(*this) << "vesk::ReflectedEnum const& _GetReflected(" << name << " const*)\n";
  Block body(out);
  StringTable strings;
  if (!metadata.empty()) WriteMetadataByteCode(out, name + "_metadata", strings, metadata);
  WriteStringTable(out, strings, name);
  const bool hasLabels = !m_labels.empty();
  if (!m_isClass && hasLabels) {
    WriteTable(out, *this, "vesk::ConstStringZ", name + "_strings", "", WriteLabelRows);
    if (!m_values.empty()) WriteTable(out, *this, "const vesk::int32", name + "_values", "", WriteValueRows);
    if (HasDisabledLabel()) WriteTable(out, *this, "const bool", name + "_enabled", "", WriteEnabledRows);
  }
  auto table = [&](std::string_view function, std::string_view array) {
    return name + std::string(m_isClass ? function : array);
  };
  out << "static const vesk::ReflectedEnum " << name << "_enum =\n";
  {
    Block record(out, ";");
    out << "\"" << GetQualifiedName() << "\",\n";
    out << NameOrZero(!metadata.empty(), name + "_metadata") << ",\n";
    out << NameOrZero(!strings.Empty(), name + "_stringTable") << ",\n";
    out << m_labels.size() << ",\n";
    out << NameOrZero(hasLabels, table("::stringArray()", "_strings")) << ",\n";
    out << NameOrZero(!m_values.empty(), table("::valueArray()", "_values")) << ",\n";
    out << NameOrZero(HasDisabledLabel(), table("::enabledArray()", "_enabled")) << "\n";
  }
  out << "return " << name << "_enum;\n";
}

}  // namespace qrex
