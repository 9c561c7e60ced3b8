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

void WriteTable(TextWriter& out, const EnumDef& def, std::string_view type, std::string_view name,
                WriteRows writeRows) {
  Write(out, R"(
    static $type$ $name$[] =
    {
        $rows$
    };
  )",
        "type"_ = type, "name"_ = name, "rows"_([&] { writeRows(out, def); }));
}

void WriteTableFunction(TextWriter& out, const EnumDef& def, std::string_view heading, std::string_view type,
                        WriteRows writeRows) {
  Write(out, R"(
    static $heading$()
    {
        static $type$ _s[] =$blank$
        {
            $rows$
        };
        return _s;
    }
  )",
        "heading"_ = heading, "type"_ = type, "blank"_ = " ", "rows"_([&] { writeRows(out, def); }));
}

void WriteEnumeration(TextWriter& out, const EnumDef& def, std::string_view name) {
  auto writeLabels = [&] {
    for (size_t i = 0; i < def.m_labels.size(); ++i) {
      out << def.m_labels[i];
      if (!def.m_values.empty()) out << "=" << def.m_values[i];
      out << (i + 1 < def.m_labels.size() ? ",\n" : "\n");
    }
  };
  Write(out, R"(
    enum $name$ : int
    {
        $labels$
    };
  )",
        "name"_ = name, "labels"_ = writeLabels);
}

void WriteTableFunctions(TextWriter& out, const EnumDef& def) {
  WriteTableFunction(out, def, "vesk::ConstStringZ const * stringArray", "vesk::ConstStringZ const", WriteLabelRows);
  if (!def.m_values.empty()) {
    WriteTableFunction(out, def, "const vesk::int32* valueArray", "const vesk::int32", WriteValueRows);
  }
  if (def.HasDisabledLabel()) {
    WriteTableFunction(out, def, "const bool* enabledArray", "const bool", WriteEnabledRows);
  }
}

void WriteEnumClass(TextWriter& out, const EnumDef& def) {
  const bool hasValues = !def.m_values.empty();
  Write(out, R"(
    class $name$ : public vesk::$base$<$name$>
    {
        public:
        $enumeration$
        $name$(Enum _v) : $base$(_v) {}
        explicit $name$(int _v = $default$) : $base$(_v) {}
        enum { LEN = $count$ };
        $tables$
    };
  )",
        "name"_ = def.name, "base"_ = hasValues ? "EnumBaseForRefinedLabels" : "EnumBase",
        "enumeration"_([&] { WriteEnumeration(out, def, "Enum"); }),
        "default"_ = hasValues ? def.m_values[def.m_defaultIndex] : static_cast<int64_t>(def.m_defaultIndex),
        "count"_ = def.m_labels.size(), "tables"_([&] { WriteTableFunctions(out, def); }));
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
  Write(out, R"(
    $api$vesk::ReflectedEnum const& _GetReflected($name$ const*);
    inline vesk::TypeOps const& _GetTypeOps($name$ const*) { return vesk::GetTypeOps<vesk::int32>(); }
  )",
        "api"_ = ExportPrefix(def), "name"_ = def.name);
}

void WriteEnumSerialise(TextWriter& out, const EnumDef& def) {
  if (def.m_isClass) return;
  Write(out, R"(
    template<typename Archive> inline void Serialise(Archive& _ar,$name$ _x) { vesk::SerialiseVariableLengthUint(_ar, (int)_x); }
    template<typename Archive> inline void Deserialise(Archive& _ar,$name$& _x) { vesk::DeserialiseVariableLengthUint(_ar, (int&)_x); }
  )",
        "name"_ = def.name);
}

void EnumDef::WriteReflectedDefinition(TextWriter& out) {
  StringTable strings;
  const bool hasLabels = !m_labels.empty();
  const bool hasValues = !m_values.empty();
  auto writeMetadata = [&] {
    if (!metadata.empty()) WriteMetadataByteCode(out, name + "_metadata", strings, metadata);
  };
  auto writeTables = [&] {
    if (m_isClass || !hasLabels) return;
    WriteTable(out, *this, "vesk::ConstStringZ", name + "_strings", WriteLabelRows);
    if (hasValues) WriteTable(out, *this, "const vesk::int32", name + "_values", WriteValueRows);
    if (HasDisabledLabel()) WriteTable(out, *this, "const bool", name + "_enabled", WriteEnabledRows);
  };
  auto nameOf = [&](bool present, std::string_view function, std::string_view array) {
    return NameOrZero(present, name + std::string(m_isClass ? function : array));
  };
  Write(out, R"(
    $api$vesk::ReflectedEnum const& _GetReflected($name$ const*)
    {
        $metadata$
        $strings$
        $tables$
        static const vesk::ReflectedEnum $name$_enum =
        {
            "$qualifiedName$",
            $metadataName$,
            $stringsName$,
            $count$,
            $labelsName$,
            $valuesName$,
            $enabledName$
        };
        return $name$_enum;
    }
  )",
        "api"_ = ExportPrefix(*this), "name"_ = name, "qualifiedName"_ = GetQualifiedName(),
        "metadata"_ = writeMetadata, "strings"_([&] { WriteStringTable(out, strings, name); }), "tables"_ = writeTables,
        "metadataName"_ = NameOrZero(!metadata.empty(), name + "_metadata"),
        "stringsName"_([&] { WriteStringTableName(out, strings, name); }), "count"_ = m_labels.size(),
        "labelsName"_ = nameOf(hasLabels, "::stringArray()", "_strings"),
        "valuesName"_ = nameOf(hasValues, "::valueArray()", "_values"),
        "enabledName"_ = nameOf(HasDisabledLabel(), "::enabledArray()", "_enabled"));
}

}  // namespace qrex
