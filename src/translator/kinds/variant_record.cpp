#include "translator/emit/emit.h"
#include "translator/kinds/variant_def.h"

namespace qrex {

void VariantDef::WriteReflectedDefinition(TextWriter& out) {
  StringTable strings;
  auto writeMetadata = [&] {
    if (!metadata.empty()) WriteMetadataByteCode(out, name + "_metadata", strings, metadata);
  };
  auto writeType = [&](const auto& item) {
    if (item->isStruct) {
      out << "// todo : byte code for anonymous struct\n";
    } else {
      WriteTypeByteCode(out, name + "_" + item->MangledTagName(), strings, item->type);
    }
  };
  auto writeRow = [&](const auto& item) {
    Write(out, R"(
      { "$item$", 4, $type$ },
    )",
          "item"_ = item->EffectiveName(), "type"_ = item->isStruct ? "NULL" : name + "_" + item->MangledTagName());
  };
  Write(out, R"(
    $api$vesk::ReflectedVariant const& _GetReflected($name$ const*)
    {
        $metadata$
        $types$
        static const vesk::ReflectedField $name$_fields[] =
        {
            $rows$
        };
        $strings$
        static const vesk::ReflectedVariant $name$_variant =
        {
            "$qualifiedName$",
            sizeof($name$),
            $metadataName$,
            $fieldsName$,
            $stringsName$,
            {
                $typeOps$
            }
        };
        return $name$_variant;
    }
    $api$vesk::TypeOps const& _GetTypeOps($name$ const*)
    {
        return vesk::GetReflectedVariant<$name$>().m_ops;
    }
  )",
        "api"_ = ExportPrefix(*this), "name"_ = name, "qualifiedName"_ = GetQualifiedName(),
        "metadata"_ = writeMetadata, "types"_ = Each(out, m_items, "", writeType),
        "rows"_ = Each(out, m_items, "", writeRow), "strings"_([&] { WriteStringTable(out, strings, name); }),
        "metadataName"_ = NameOrZero(!metadata.empty(), name + "_metadata"),
        "fieldsName"_ = CountedName(m_items.size(), name + "_fields"),
        "stringsName"_([&] { WriteStringTableName(out, strings, name); }),
        "typeOps"_([&] { WriteTypeOps(out, name, TypeOpsBits()); }));
}

}  // namespace qrex
