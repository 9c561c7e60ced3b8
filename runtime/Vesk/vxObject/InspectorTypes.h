// The types of a program for the page: what is registered, by the projects that registered it, and all that a record
// tells of one of them.

@import "Vesk/vxObject/InspectorRows.h"

namespace vesk {

class InspectorTypes {
 public:
  // {"projects": [{"name", "release", "classes": [...], "enums": ..., "variants": ..., "interfaces": ...}]}
  static void PutAll(InspectorWriter& out) {
    out.Name("projects").Open('[');
    for (XTarget const* target : AllTargets()) {
      out.Open('{').Member("name", target->m_name).Member("release", target->m_rsn);
      PutNames<ReflectedClass>(out, "classes", target);
      PutNames<ReflectedEnum>(out, "enums", target);
      PutNames<ReflectedVariant>(out, "variants", target);
      PutNames<ReflectedInterface>(out, "interfaces", target);
      PutNames<ReflectedFunctor>(out, "functors", target);
      PutNames<ReflectedTypedef>(out, "typedefs", target);
      out.Close('}');
    }
    out.Close(']');
  }

  // What a name stands for. InspectorError for none.
  static void PutType(InspectorWriter& out, xstring const& name) {
    out.Member("name", name);
    if (ReflectedClass const* record = Find<ReflectedClass>(name)) return PutClass(out, *record);
    if (ReflectedEnum const* record = Find<ReflectedEnum>(name)) return PutEnum(out, *record);
    if (ReflectedVariant const* record = Find<ReflectedVariant>(name)) return PutVariant(out, *record);
    if (ReflectedInterface const* record = Find<ReflectedInterface>(name)) return PutInterface(out, *record);
    if (ReflectedFunctor const* record = Find<ReflectedFunctor>(name)) {
      PutHead(out, "functor", TargetOf(*record), record->m_metadata, record->m_strings);
      out.Name("methods").Open('[');
      PutSignature(out, "", record->m_return, record->m_args, record->m_numArgs, nullptr, record->m_strings);
      out.Close('}').Close(']');
    } else if (ReflectedTypedef const* alias = Find<ReflectedTypedef>(name)) {
      PutHead(out, "typedef", TargetOf(*alias), nullptr, nullptr);
      out.Member("type", TypeText({alias->m_type, alias->m_strings}));
    } else {
      throw InspectorError("no registered type is called " + name);
    }
  }

  // A signature, which is left open.
  static void PutSignature(InspectorWriter& out, ConstStringZ name, ReflectedReturnType const& result,
                           ReflectedArg const* args, ssize_t count, octet_t const* metadata,
                           ConstStringZ const* strings) {
    out.Open('{').Member("name", name);
    out.Member("result", result.m_type ? TypeText({result.m_type, strings}) : xstring("void"));
    out.Name("args").Open('[');
    for (ssize_t i = 0; i < count; ++i) {
      out.Open('{').Member("name", args[i].m_name);
      PutDeclared(out, DecodeType({args[i].m_type, strings}));
      out.Close('}');
    }
    out.Close(']');
    PutMetadata(out, metadata, strings);
  }
  // The type without metadata, and these.
  static void PutDeclared(InspectorWriter& out, ReflectedType type) {
    const xvector<MetadataValue> metadata = std::move(type.m_metadata);
    type.m_metadata.clear();
    out.Member("type", vxMakeString(type));
    PutMetadata(out, metadata);
  }
  static void PutMetadata(InspectorWriter& out, xvector<MetadataValue> const& metadata) {
    if (metadata.empty()) return;
    out.Member("metadata", TextOf([&](xostream& os) {
                 for (MetadataValue const& value : metadata) os << value;
               }));
    InspectorMetadata(metadata).Put(out);
  }

 private:
  template <typename R>
  static void PutNames(InspectorWriter& out, ConstStringZ kind, XTarget const* target) {
    bool isOpen = false;
    for (R const* record : All<R>()) {
      if (TargetOf(*record) != target) continue;
      if (!std::exchange(isOpen, true)) out.Name(kind).Open('[');
      out.Put(record->m_name);
    }
    if (isOpen) out.Close(']');
  }
  static void PutMetadata(InspectorWriter& out, octet_t const* metadata, ConstStringZ const* strings) {
    if (metadata) PutMetadata(out, xvector<MetadataValue>{DecodeMetadata({metadata, strings})});
  }
  static void PutHead(InspectorWriter& out, ConstStringZ kind, XTarget const* target, octet_t const* metadata,
                      ConstStringZ const* strings) {
    out.Member("is", kind);
    if (target) out.Member("project", target->m_name).Member("release", target->m_rsn);
    PutMetadata(out, metadata, strings);
  }
  static void PutTexts(InspectorWriter& out, ConstStringZ name, ConstStringZ const* texts, ssize_t count) {
    if (count <= 0) return;
    out.Name(name).Open('[');
    for (ssize_t i = 0; i < count; ++i) out.Put(texts[i]);
    out.Close(']');
  }
  static void PutField(InspectorWriter& out, ConstStringZ name, octet_t const* type, ConstStringZ const* strings) {
    out.Open('{').Member("name", name);
    if (type) PutDeclared(out, DecodeType({type, strings}));
  }

  static void PutClass(InspectorWriter& out, ReflectedClass const& record) {
    ConstStringZ const* const strings = record.m_strings;
    ConstStringZ const kind = record.m_flags & CF_ADT ? "abstract type" : record.m_flags & CF_MODEL ? "model" : "class";
    PutHead(out, kind, TargetOf(record), record.m_metadata, strings);
    out.Member("size", record.m_size);
    PutTexts(out, "interfaces", record.m_interfaces ? record.m_interfaces + record.m_numBaseInterfaces : nullptr,
             record.m_numInterfaces - record.m_numBaseInterfaces);
    out.Name("fields").Open('[');
    for (ssize_t i = 0; i < record.m_numFields; ++i) {
      PutField(out, record.m_fields[i].m_name, record.m_fields[i].m_type, strings);
      out.Close('}');
    }
    for (ssize_t i = 0; i < record.m_numModelFields; ++i) {
      ReflectedModelField const& field = record.m_modelFields[i];
      PutField(out, field.m_name, field.m_type, strings);
      out.Member(field.m_type ? "model" : "references", true).Member("added", field.m_added);
      if (field.m_dropped >= 0) out.Member("dropped", field.m_dropped);
      out.Close('}');
    }
    for (ssize_t i = 0; i < record.m_numDepFields; ++i) {
      PutField(out, record.m_depFields[i].m_name, record.m_depFields[i].m_type, strings);
      out.Member("calculated", true).Close('}');
    }
    out.Close(']').Name("methods").Open('[');
    for (ssize_t i = 0; i < record.m_numMethods; ++i) {
      ReflectedClassMethod const& method = record.m_methods[i];
      PutSignature(out, method.m_name, method.m_return, method.m_args, method.m_numArgs, method.m_metadata, strings);
      out.Member("const", method.m_isConst).Close('}');
    }
    out.Close(']');
  }
  static void PutEnum(InspectorWriter& out, ReflectedEnum const& record) {
    PutHead(out, "enumeration", TargetOf(record), record.m_metadata, record.m_strings);
    InspectorRows::PutEnumLabels(out, record);
  }
  static void PutVariant(InspectorWriter& out, ReflectedVariant const& record) {
    PutHead(out, "variant", TargetOf(record), record.m_metadata, record.m_strings);
    out.Member("size", record.m_size).Name("fields").Open('[');
    for (ssize_t i = 0; i < record.m_numItems; ++i) {
      PutField(out, record.m_items[i].m_name, record.m_items[i].m_type, record.m_strings);
      out.Close('}');
    }
    out.Close(']');
  }
  static void PutInterface(InspectorWriter& out, ReflectedInterface const& record) {
    PutHead(out, "interface", TargetOf(record), record.m_metadata, record.m_strings);
    PutTexts(out, "interfaces", record.m_bases, record.m_numBases);
    out.Name("fields").Open('[');
    for (ssize_t i = 0; i < record.m_numAttributes; ++i) {
      PutField(out, record.m_attributes[i].m_name, record.m_attributes[i].m_type, record.m_strings);
      out.Close('}');
    }
    out.Close(']').Name("methods").Open('[');
    for (ssize_t i = 0; i < record.m_numMethods; ++i) {
      ReflectedInterfaceMethod const& method = record.m_methods[i];
      PutSignature(out, method.m_name, method.m_return, method.m_args, method.m_numArgs, method.m_metadata,
                   record.m_strings);
      out.Close('}');
    }
    out.Close(']');
  }
};

}  // namespace vesk
