// The reflection record of a class, and the rest of its text in the reflection tail.

#include <algorithm>

#include "translator/class/class_emission.h"
#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/emit/records.h"
#include "translator/interface/interface_def.h"
#include "translator/model/model.h"

namespace qrex {

namespace {

// Writes one record: all its arrays share one string table, and its last rows refer to the arrays above them.
class ClassRecord {
 public:
  ClassRecord(TextWriter& out, const ClassDef& def) : m_out(out), m_def(def), m_name(def.name) {}
  void WriteFunction();

 private:
  std::vector<const ClassField*> ReflectedFields(bool dep) const;
  void WriteTypeCodes(const std::vector<const ClassField*>& fields);
  void WriteFields();
  void WriteDepFields();
  void WriteModelFields();
  void WriteMapOrSetFunctions(const ModelField& field);
  void WriteMethods();
  void WriteMethodRow(const FunctionSignature& method);
  void WriteInterfaces();
  void WriteArrays();
  void WriteRecord();
  std::string Part(std::string_view suffix) const { return m_name + std::string(suffix); }
  uint32_t Flags() const;

  TextWriter& m_out;
  const ClassDef& m_def;
  const std::string& m_name;
  StringTable m_strings;
  size_t m_fieldCount = 0, m_depFieldCount = 0, m_modelFieldCount = 0;
  std::vector<const InterfaceDef*> m_flattened;
};

std::vector<const ClassField*> ClassRecord::ReflectedFields(bool dep) const {
  std::vector<const ClassField*> fields;
  auto collect = [&](const ClassDef& def) {
    for (const ClassField& field : def.m_fields) {
      if (field.reflected && (field.kind == FieldKind::Dep) == dep) fields.push_back(&field);
    }
  };
  collect(m_def);
  for (const ClassDef* mixin : m_def.m_mixins) collect(*mixin);
  return fields;
}

void ClassRecord::WriteTypeCodes(const std::vector<const ClassField*>& fields) {
  for (const ClassField* field : fields) {
    if (field->kind == FieldKind::Dep && IsVoid(field->type)) continue;  // keeps nothing
    WriteTypeByteCode(m_out, m_name + "_" + field->name, m_strings, field->type);
  }
}

void ClassRecord::WriteFields() {
  const std::vector<const ClassField*> fields = ReflectedFields(false);
  m_fieldCount = fields.size();
  WriteTypeCodes(fields);
  if (fields.empty()) return;
  auto row = [&](const ClassField* field) {
    Write(m_out, "{ \"$field$\", offsetof($class$,$field$), $class$_$field$ },\n", "field"_ = field->name,
          "class"_ = m_name);
  };
  Write(m_out, R"(
    static const vesk::ReflectedField $class$_fields[] =
    {
        $rows$
    };
  )",
        "class"_ = m_name, "rows"_ = Each(m_out, fields, "", row));
}

void ClassRecord::WriteDepFields() {
  const std::vector<const ClassField*> fields = ReflectedFields(true);
  m_depFieldCount = fields.size();
  WriteTypeCodes(fields);
  if (fields.empty()) return;
  auto row = [&](const ClassField* field) {
    if (IsVoid(field->type)) {
      Write(m_out, "{ \"$field$\", 0, 0, offsetof($class$,$field$) },\n", "field"_ = field->name, "class"_ = m_name);
    } else {
      Write(m_out, "{ \"$field$\", offsetof($class$,_$field$_), $class$_$field$, offsetof($class$,$field$) },\n",
            "field"_ = field->name, "class"_ = m_name);
    }
  };
  Write(m_out, R"(
    static const vesk::ReflectedDepField $class$_depfields[] =
    {
        $rows$
    };
  )",
        "class"_ = m_name, "rows"_ = Each(m_out, fields, "", row));
}

void ClassRecord::WriteMapOrSetFunctions(const ModelField& field) {
  TypeView type = MapOrSetIn(field.m_type);
  if (type.Empty()) return;
  auto rows = [&] {
    for (; !type.Empty(); type = MapOrSetIn(type.Value())) {
      if (type.Op() == kOpSet) {
        return Write(m_out, "{(const vesk::XMapFns*) &vesk::IXSet::Stubs<$type$ >::GetTable()},\n", "type"_ = type);
      }
      Write(m_out, "{&vesk::IXMap::Stubs<$type$ >::GetTable()},\n", "type"_ = type);
    }
  };
  Write(m_out, R"(
    static const vesk::PtrMapOrSetFns $class$_$field$_mapOrSetfns[] =$blank$
    {
        $rows$
    };
  )",
        "class"_ = m_name, "field"_ = field.m_name, "blank"_ = ' ', "rows"_ = rows);
}

void ClassRecord::WriteModelFields() {
  const std::vector<MixedModelField> fields = AllModelFields(m_def);
  for (const MixedModelField& mixed : fields) {
    WriteTypeByteCode(m_out, m_name + "_" + mixed.field->m_name, m_strings, mixed.field->m_type);
    WriteMapOrSetFunctions(*mixed.field);
  }
  if (fields.empty() && !m_def.m_referencedModel) return;
  Write(m_out, R"(
    static const vesk::ReflectedModelField $class$_modelFields[] =
    {
        $rows$
    };
  )",
        "class"_ = m_name, "rows"_([&] { m_modelFieldCount = WriteModelFieldRows(m_out, m_def); }));
}

void ClassRecord::WriteMethodRow(const FunctionSignature& method) {
  const std::string prefix = m_name + "_" + method.name;
  auto parameters = [&] { WriteSelfAndArgDeclarations(m_out, m_name, method); };
  auto forwarder = [&] {
    Write(m_out, "[]($parameters$) -> $type$ { $return$_self->$method$($arguments$); }", "parameters"_ = parameters,
          "type"_ = TypeView(method.returnType), "return"_ = If(!IsVoid(method.returnType), "return "),
          "method"_ = method.name, "arguments"_([&] { WriteArgNames(m_out, method.arguments); }));
  };
  auto address = [&] {
    // The function behind a class in place is a template, or hidden in the class around: it has no address to name
    // here.
    if (m_def.IsWholeInPlace()) return forwarder();
    m_out << "&" << (m_def.parent ? m_def.parent->GetQualifiedName() : std::string()) << "::" << method.name;
  };
  Write(m_out, R"(
    {"$method$",{$return$},$arguments$,$metadata$,$isConst$,(vesk::FunctionPointer)($type$ (__stdcall *)($parameters$))$address$},
  )",
        "method"_ = method.name, "return"_ = NameOrZero(!IsVoid(method.returnType), prefix + "_return"),
        "arguments"_ = CountedName(method.arguments.size(), prefix + "_args"),
        "metadata"_ = NameOrZero(!method.metadata.empty(), prefix + "_metadata"), "isConst"_ = BoolText(method.isConst),
        "type"_ = TypeView(method.returnType), "parameters"_ = parameters, "address"_ = address);
}

void ClassRecord::WriteMethods() {
  for (const FunctionSignature& method : m_def.m_methods) {
    WriteSignatureArrays(m_out, m_name + "_" + method.name, method, m_strings);
  }
  if (m_def.m_methods.empty()) return;
  Write(m_out, R"(
    static const vesk::ReflectedClassMethod $class$_methods[] =
    {
        $rows$
    };
  )",
        "class"_ = m_name,
        "rows"_ = Each(m_out, m_def.m_methods, "", [&](const FunctionSignature& method) { WriteMethodRow(method); }));
}

void ClassRecord::WriteInterfaces() {
  if (m_def.m_interfaces.empty()) return;
  for (const InterfaceDef* interface : m_def.m_interfaces) {
    for (const InterfaceDef::FlatBase& flat : interface->FlattenedBases()) m_flattened.push_back(flat.base);
  }
  auto row = [&](const InterfaceDef* interface) { m_out << "\"" << interface->GetQualifiedName() << "\",\n"; };
  Write(m_out, R"(
    static vesk::ConstStringZ $class$_interfaces[] =
    {
        $flattened$
        $direct$
    };
  )",
        "class"_ = m_name, "flattened"_ = Each(m_out, m_flattened, "", row),
        "direct"_ = Each(m_out, m_def.m_interfaces, "", row));
}

// As ReflectedClass::m_flags of the runtime has them.
enum ClassFlag : uint32_t {
  kFlagClass = 1,
  kFlagModel = 2,
  kFlagHasModel = 4,
  kFlagReferencesModel = 8,
  kFlagAdt = 16,
  kFlagPassByValue = 32,
  kFlagReturnByValue = 64,
  kFlagRod = 128
};

uint32_t ClassRecord::Flags() const {
  uint32_t flags = 0;
  if (m_def.m_kind == ClassKind::Class) flags |= kFlagClass;
  if (m_def.IsPureModel()) flags |= kFlagModel;
  if (m_def.HasEmbeddedModel()) flags |= kFlagHasModel;
  if (m_def.m_referencedModel) flags |= kFlagReferencesModel;
  if (m_def.IsAdt()) flags |= kFlagAdt;
  if (m_def.m_qualifiers.passbyvalue == TriState::On) flags |= kFlagPassByValue;
  if (m_def.m_qualifiers.returnbyvalue == TriState::On) flags |= kFlagReturnByValue;
  if (m_def.m_qualifiers.rod == TriState::On) flags |= kFlagRod;
  return flags;
}

void ClassRecord::WriteRecord() {
  const std::string& className = m_def.GetTemplateClassName();
  const std::string stubs = m_def.m_implementsIObject ? "&vesk::IObject::Stubs<" + className + ">::GetTable()" : "0";
  auto interfaces = [&] {
    if (m_def.m_interfaces.empty()) {
      m_out << "0,0,0";
    } else {
      Write(m_out, "$class$_interfaces,$flattened$,$direct$", "class"_ = m_name, "flattened"_ = m_flattened.size(),
            "direct"_ = m_def.m_interfaces.size());
    }
  };
  Write(m_out, R"(
    static const vesk::ReflectedClass $class$_class =
    {
        $flags$,
        "$qualifiedName$",
        sizeof($templateClass$),
        $metadata$,
        $fields$,
        $modelFields$,
        $depFields$,
        $methods$,
        $strings$,
        $interfaces$,
        $stubs$,
        $create$,
        {
            $operations$
        }
    };
  )",
        "class"_ = m_name, "flags"_ = Flags(), "qualifiedName"_ = m_def.GetQualifiedName(),
        "templateClass"_ = className, "metadata"_ = NameOrZero(!m_def.metadata.empty(), Part("_metadata")),
        "fields"_ = CountedName(m_fieldCount, Part("_fields")),
        "modelFields"_ = CountedName(m_modelFieldCount, Part("_modelFields")),
        "depFields"_ = CountedName(m_depFieldCount, Part("_depfields")),
        "methods"_ = CountedName(m_def.m_methods.size(), Part("_methods")),
        "strings"_ = NameOrZero(!m_strings.Empty(), Part("_stringTable")), "interfaces"_ = interfaces, "stubs"_ = stubs,
        "create"_ = NameOrZero(HasCreateFunction(m_def), "&" + className + "::sfnCreateInstance"),
        "operations"_([&] { WriteTypeOps(m_out, m_name, m_def.TypeOpsBits()); }));
}

void ClassRecord::WriteFunction() {
  Write(m_out, R"(
    $api$vesk::ReflectedClass const& _GetReflected($class$ const*)
    {
        $arrays$
        $record$

        return $class$_class;
    }
  )",
        "api"_ = If(!m_def.IsWholeInPlace(), ExportPrefix(m_def)), "class"_ = m_name, "arrays"_([&] { WriteArrays(); }),
        "record"_([&] { WriteRecord(); }));
}

// In the order in which the string table takes their names.
void ClassRecord::WriteArrays() {
  if (!m_def.metadata.empty()) WriteMetadataByteCode(m_out, m_name + "_metadata", m_strings, m_def.metadata);
  WriteFields();
  WriteDepFields();
  WriteModelFields();
  WriteMethods();
  WriteStringTable(m_out, m_strings, m_name);
  WriteInterfaces();
}

// `heading`: what is ahead of the name of the function, and what qualifies it.
void WriteCreateInstance(TextWriter& out, const ClassDef& def, std::string_view heading, std::string_view scope) {
  auto found = std::find_if(def.m_interfaces.begin(), def.m_interfaces.end(),
                            [](const InterfaceDef* interface) { return interface->SubtypesIObject(); });
  Write(out, R"(
    $heading$vesk::ptr<vesk::IObject> __stdcall $scope$sfnCreateInstance()
    {
        return static_cast<vesk::ptr<$interface$> >(new $class$());
    }
  )",
        "heading"_ = heading, "scope"_ = scope, "class"_ = def.GetTemplateClassName(),
        "interface"_ = found == def.m_interfaces.end() ? std::string() : (*found)->GetQualifiedName());
}

}  // namespace

bool HasCreateFunction(const ClassDef& def) { return def.HasDefaultCtor() && def.m_implementsIObject; }

void WriteCreateInstanceMember(TextWriter& out, const ClassDef& def) {
  if (def.IsWholeInPlace()) return WriteCreateInstance(out, def, "static ", "");
  out << "static vesk::ptr<vesk::IObject> __stdcall sfnCreateInstance();\n";
}

void WriteGetReflected(TextWriter& out, const ClassDef& def) { ClassRecord(out, def).WriteFunction(); }

void WriteGetTypeOps(TextWriter& out, const ClassDef& def) {
  Write(out, R"(
    $api$$prefix$vesk::TypeOps const& _GetTypeOps($class$ const*)
    {
        return vesk::GetReflectedClass<$class$>().m_ops;
    }
  )",
        "api"_ = If(!def.IsWholeInPlace(), ExportPrefix(def)), "prefix"_ = def.FunctionPrefix(),
        "class"_ = def.GetTemplateClassName());
}

void ClassDef::WriteReflectedDefinition(TextWriter& out) {
  if (HasCreateFunction(*this)) WriteCreateInstance(out, *this, TemplatePrefix(), GetTemplateClassName() + "::");
  if (MemberPlacement() == Placement::InClass) return;
  WriteGetReflected(out, *this);
  WriteGetTypeOps(out, *this);
}

void ClassDef::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  if (!HaveSomethingToRegister() || IsWholeInPlace()) return;
  const bool isConcrete = MemberPlacement() == Placement::OutOfClass;
  WriteReflectionHead(out, *this);
  if (isConcrete) WriteModelRsnDeclarations(out, *this);
  NameSpaceFrame frame(out, parent);
  IndentScope indent(out, 4);
  if (m_reflected) WriteReflectedDefinition(out);
  if (isConcrete) {
    if (m_implementsIObject) WriteInterfaceDefinitions(out, *this);
    if (HasEmbeddedModel()) {
      WriteVisiting(out, *this, Placement::OutOfClass);
      WriteSerialise(out, *this, Placement::OutOfClass);
      WriteDeserialise(out, *this, Placement::OutOfClass);
    }
    WriteDataSourceRsnFunctions(out, *this, Placement::OutOfClass);
    if (!IsMixin()) WriteModelStreamInsertionInTail(out, *this);
  }
  out << m_deferredText;
  WriteRegistration(out, *this, lists);
}

}  // namespace qrex
