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
  void Write();

 private:
  std::vector<const ClassField*> ReflectedFields(bool dep) const;
  void WriteFields();
  void WriteDepFields();
  void WriteModelFields();
  void WriteMapOrSetFunctions(const ModelField& field);
  void WriteMethods();
  void WriteMethodRow(const FunctionSignature& method);
  void WriteInterfaces();
  void WriteRecord();
  void WriteTableRow(size_t count, std::string_view suffix);
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

void ClassRecord::WriteFields() {
  const std::vector<const ClassField*> fields = ReflectedFields(false);
  m_fieldCount = fields.size();
  for (const ClassField* field : fields) WriteTypeByteCode(m_out, m_name + "_" + field->name, m_strings, field->type);
  if (fields.empty()) return;
  m_out << "static const vesk::ReflectedField " << m_name << "_fields[] =\n";
  Block rows(m_out, ";");
  for (const ClassField* field : fields) {
    WriteText(m_out, "{ \"$1\", offsetof($0,$1), $0_$1 },\n", {m_name, field->name});
  }
}

void ClassRecord::WriteDepFields() {
  const std::vector<const ClassField*> fields = ReflectedFields(true);
  m_depFieldCount = fields.size();
  for (const ClassField* field : fields) {
    if (!IsVoid(field->type)) WriteTypeByteCode(m_out, m_name + "_" + field->name, m_strings, field->type);
  }
  if (fields.empty()) return;
  m_out << "static const vesk::ReflectedDepField " << m_name << "_depfields[] =\n";
  Block rows(m_out, ";");
  for (const ClassField* field : fields) {
    WriteText(m_out,
              IsVoid(field->type) ? "{ \"$1\", 0, 0, offsetof($0,$1) },\n"
                                  : "{ \"$1\", offsetof($0,_$1_), $0_$1, offsetof($0,$1) },\n",
              {m_name, field->name});
  }
}

void ClassRecord::WriteMapOrSetFunctions(const ModelField& field) {
  TypeView type = MapOrSetIn(field.m_type);
  if (type.Empty()) return;
  m_out << "static const vesk::PtrMapOrSetFns " << m_name << "_" << field.m_name << "_mapOrSetfns[] = \n";
  Block rows(m_out, ";");
  for (; !type.Empty(); type = MapOrSetIn(type.Value())) {
    if (type.Op() == kOpSet) {
      m_out << "{(const vesk::XMapFns*) &vesk::IXSet::Stubs<" << TypeText(type) << " >::GetTable()},\n";
      return;
    }
    m_out << "{&vesk::IXMap::Stubs<" << TypeText(type) << " >::GetTable()},\n";
  }
}

void ClassRecord::WriteModelFields() {
  const std::vector<MixedModelField> fields = AllModelFields(m_def);
  for (const MixedModelField& mixed : fields) {
    WriteTypeByteCode(m_out, m_name + "_" + mixed.field->m_name, m_strings, mixed.field->m_type);
    WriteMapOrSetFunctions(*mixed.field);
  }
  if (fields.empty() && !m_def.m_referencedModel) return;
  m_out << "static const vesk::ReflectedModelField " << m_name << "_modelFields[] =\n";
  Block rows(m_out, ";");
  m_modelFieldCount = WriteModelFieldRows(m_out, m_def);
}

void ClassRecord::WriteMethodRow(const FunctionSignature& method) {
  const std::string prefix = m_name + "_" + method.name;
  m_out << "{\"" << method.name << "\",{" << NameOrZero(!IsVoid(method.returnType), prefix + "_return") << "},";
  m_out << CountedName(method.arguments.size(), prefix + "_args") << ","
        << NameOrZero(!method.metadata.empty(), prefix + "_metadata") << "," << BoolText(method.isConst)
        << ",(vesk::FunctionPointer)(";
  PrintType(m_out, method.returnType);
  m_out << " (__stdcall *)(";
  WriteSelfAndArgDeclarations(m_out, m_name, method);
  m_out << "))&" << (m_def.parent ? m_def.parent->GetQualifiedName() : std::string()) << "::" << method.name << "},\n";
}

void ClassRecord::WriteMethods() {
  for (const FunctionSignature& method : m_def.m_methods) {
    WriteSignatureArrays(m_out, m_name + "_" + method.name, method, m_strings);
  }
  if (m_def.m_methods.empty()) return;
  m_out << "static const vesk::ReflectedClassMethod " << m_name << "_methods[] =\n";
  Block rows(m_out, ";");
  for (const FunctionSignature& method : m_def.m_methods) WriteMethodRow(method);
}

void ClassRecord::WriteInterfaces() {
  if (m_def.m_interfaces.empty()) return;
  for (const InterfaceDef* interface : m_def.m_interfaces) {
    for (const InterfaceDef::FlatBase& flat : interface->FlattenedBases()) m_flattened.push_back(flat.base);
  }
  m_out << "static vesk::ConstStringZ " << m_name << "_interfaces[] =\n";
  Block rows(m_out, ";");
  for (const InterfaceDef* interface : m_flattened) m_out << "\"" << interface->GetQualifiedName() << "\",\n";
  for (const InterfaceDef* interface : m_def.m_interfaces) m_out << "\"" << interface->GetQualifiedName() << "\",\n";
}

uint32_t ClassRecord::Flags() const {
  uint32_t flags = 0;
  if (m_def.kind == ClassKind::Class) flags |= 1;
  if (m_def.IsPureModel()) flags |= 2;
  if (m_def.HasEmbeddedModel()) flags |= 4;
  if (m_def.m_referencedModel) flags |= 8;
  if (m_def.IsAdt()) flags |= 16;
  if (m_def.qualifiers.passbyvalue == TriState::On) flags |= 32;
  if (m_def.qualifiers.returnbyvalue == TriState::On) flags |= 64;
  if (m_def.qualifiers.rod == TriState::On) flags |= 128;
  return flags;
}

void ClassRecord::WriteTableRow(size_t count, std::string_view suffix) {
  m_out << CountedName(count, m_name + std::string(suffix)) << ",\n";
}

void ClassRecord::WriteRecord() {
  const std::string& className = m_def.GetTemplateClassName();
  m_out << "static const vesk::ReflectedClass " << m_name << "_class =\n";
  Block record(m_out, ";");
  m_out << Flags() << ",\n";
  m_out << "\"" << m_def.GetQualifiedName() << "\",\n";
  m_out << "sizeof(" << className << "),\n";
  m_out << NameOrZero(!m_def.metadata.empty(), m_name + "_metadata") << ",\n";
  WriteTableRow(m_fieldCount, "_fields");
  WriteTableRow(m_modelFieldCount, "_modelFields");
  WriteTableRow(m_depFieldCount, "_depfields");
  WriteTableRow(m_def.m_methods.size(), "_methods");
  m_out << NameOrZero(!m_strings.Empty(), m_name + "_stringTable") << ",\n";
  if (m_def.m_interfaces.empty()) {
    m_out << "0,0,0,\n";
  } else {
    m_out << m_name << "_interfaces," << m_flattened.size() << "," << m_def.m_interfaces.size() << ",\n";
  }
  m_out << NameOrZero(m_def.m_implementsIObject, "&vesk::IObject::Stubs<" + className + ">::GetTable()") << ",\n";
  m_out << NameOrZero(HasCreateFunction(m_def), "&" + className + "::sfnCreateInstance") << ",\n";
  Block ops(m_out);
  WriteTypeOps(m_out, m_name, m_def.TypeOpsBits());
}

void ClassRecord::Write() {
  m_out << ExportPrefix(m_def) << "vesk::ReflectedClass const& _GetReflected(" << m_name << " const*)\n";
  Block body(m_out);
  if (!m_def.metadata.empty()) WriteMetadataByteCode(m_out, m_name + "_metadata", m_strings, m_def.metadata);
  WriteFields();
  WriteDepFields();
  WriteModelFields();
  WriteMethods();
  WriteStringTable(m_out, m_strings, m_name);
  WriteInterfaces();
  WriteRecord();
  m_out << "\nreturn " << m_name << "_class;\n";
}

void WriteCreateInstance(TextWriter& out, const ClassDef& def) {
  const std::string& className = def.GetTemplateClassName();
  auto found = std::find_if(def.m_interfaces.begin(), def.m_interfaces.end(),
                            [](const InterfaceDef* interface) { return interface->SubtypesIObject(); });
  const std::string interface = found == def.m_interfaces.end() ? std::string() : (*found)->GetQualifiedName();
  out << def.TemplatePrefix() << "vesk::ptr<vesk::IObject> __stdcall " << className << "::sfnCreateInstance()\n";
  Block body(out);
  out << "return static_cast<vesk::ptr<" << interface << "> >(new " << className << "());\n";
}

}  // namespace

bool HasCreateFunction(const ClassDef& def) { return def.HasDefaultCtor() && def.m_implementsIObject; }

void WriteGetReflected(TextWriter& out, const ClassDef& def) { ClassRecord(out, def).Write(); }

void WriteGetTypeOps(TextWriter& out, const ClassDef& def) {
  out << ExportPrefix(def) << def.TemplatePrefix() << "vesk::TypeOps const& _GetTypeOps(" << def.GetTemplateClassName()
      << " const*)\n";
  Block body(out);
  out << "return vesk::GetReflectedClass<" << def.GetTemplateClassName() << ">().m_ops;\n";
}

void ClassDef::WriteReflectedDefinition(TextWriter& out) {
  if (HasCreateFunction(*this)) WriteCreateInstance(out, *this);
  if (MemberPlacement() == Placement::InClass) return;
  WriteGetReflected(out, *this);
  WriteGetTypeOps(out, *this);
}

void ClassDef::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  if (!HaveSomethingToRegister()) return;
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
    WriteDataSourceRsnFunctions(out, *this);
  }
  out << m_deferredText;
  WriteRegistration(out, *this, lists);
}

}  // namespace qrex
