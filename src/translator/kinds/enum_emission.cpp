#include "translator/kinds/enum_emission.h"

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"

namespace qrex {

namespace {

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

}  // namespace

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
