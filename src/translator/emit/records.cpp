#include "translator/emit/records.h"

#include "workspace/project_model.h"

namespace qrex {

void WriteReflectionHead(TextWriter& out, const NameSpaceElement& element) {
  out << "\n//### ";
  PrintElement(out, element);
  out << "\n";
  out << "namespace vesk { XTarget* " << TargetIdentifier(element) << "_GetXTarget(); }\n";
}

void WriteRegistration(TextWriter& out, const NameSpaceElement& element, RegistrationLists& lists) {
  if (!element.m_registered) return;
  lists.registerNames.push_back(element.GetQualifiedName());
  out << "\n// Registration of ";
  PrintElement(out, element);
  out << "\n";
  out << "void _Register_" << element.name << "()\n";
  Block body(out);
  out << "vxVerify(vesk::RegisterReflected" << element.GetReflectedKindName() << "(&_GetReflected( (" << element.name
      << "*) 0),vesk::" << TargetIdentifier(element) << "_GetXTarget()) == vesk::NSE_OK);\n";
}

void WriteSignatureArrays(TextWriter& out, const std::string& prefix, const FunctionSignature& signature,
                          StringTable& strings, std::string_view infix) {
  if (!signature.metadata.empty()) WriteMetadataByteCode(out, prefix + "_metadata", strings, signature.metadata);
  if (!IsVoid(signature.returnType)) WriteTypeByteCode(out, prefix + "_return", strings, signature.returnType);
  for (const FunctionArg& argument : signature.arguments) {
    WriteTypeByteCode(out, prefix + std::string(infix) + argument.name, strings, argument.type);
  }
  if (signature.arguments.empty()) return;
  out << "static const vesk::ReflectedArg " << prefix << "_args[] =\n";
  Block rows(out, ";");
  for (const FunctionArg& argument : signature.arguments) {
    WriteText(out, "{ \"$2\", $0$1$2 },\n", {prefix, infix, argument.name});
  }
}

void WriteSignatureRows(TextWriter& out, const NameSpaceElement& element, const FunctionSignature& signature,
                        const StringTable& strings) {
  const std::string& name = element.name;
  out << "\"" << element.GetQualifiedName() << "\",\n";
  out << "{" << NameOrZero(!IsVoid(signature.returnType), name + "_return") << "},\n";
  out << CountedName(signature.arguments.size(), name + "_args") << ",\n";
  out << NameOrZero(!element.metadata.empty(), name + "_metadata") << ",\n";
  out << NameOrZero(!strings.Empty(), name + "_stringTable") << ",\n";
}

void RecordedElement::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  if (!HaveSomethingToRegister() || !HasRecord()) return;
  WriteReflectionHead(out, *this);
  NameSpaceFrame frame(out, parent);
  IndentScope indent(out, 4);
  WriteReflectedDefinition(out);
  WriteRegistration(out, *this, lists);
}

void WriteTypeTraits(TextWriter& out, const NameSpaceElement& element) {
  const std::vector<const NameSpace*> path = EnclosingNameSpaces(element.parent);
  out << "\n";
  for (auto it = path.rbegin(); it != path.rend(); ++it) out << "} //" << (*it)->name << "\n";
  out << "namespace vesk\n{\n";
  out << "template<> struct TypeTraits<" << element.GetQualifiedName() << ">\n";
  {
    Block traits(out, ";");
    out << "static const bool is_exported = " << BitText(element.m_exported) << ";\n";
    out << "static const bool is_reflected = " << BitText(element.m_reflected) << ";\n";
    out << "static const bool is_registered = " << BitText(element.EffectivelyRegistered()) << ";\n";
    out << "static const vesk::ETypeTraitKind kind = vesk::" << element.kindTraits.traits << ";\n";
    out << "static const bool has_metadata = " << BitText(element.ContainsMetaData()) << ";\n";
  }
  element.WriteExtraTraits(out);
  out << "} // namespace vesk\n";
  for (const NameSpace* nameSpace : path) out << "namespace " << nameSpace->name << "\n{\n";
}

}  // namespace qrex
