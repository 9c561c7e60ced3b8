#include "translator/emit/records.h"

#include <algorithm>

#include "text/trace.h"
#include "translator/reader/qrex_parser.h"
#include "workspace/workspace.h"

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

void NameSpaceElement::WriteReflection(TextWriter& out, RegistrationLists& lists) {
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
    static constexpr std::string_view kKinds[] = {"TTK_other",     "TTK_struct",  "TTK_class",   "TTK_adt", "TTK_model",
                                                  "TTK_interface", "TTK_functor", "TTK_variant", "TTK_enum"};
    Block traits(out, ";");
    out << "static const bool is_exported = " << BitText(element.m_exported) << ";\n";
    out << "static const bool is_reflected = " << BitText(element.m_reflected) << ";\n";
    out << "static const bool is_registered = " << BitText(element.EffectivelyRegistered()) << ";\n";
    out << "static const vesk::ETypeTraitKind kind = vesk::" << kKinds[static_cast<size_t>(element.traitsKind)]
        << ";\n";
    out << "static const bool has_metadata = " << BitText(element.ContainsMetaData()) << ";\n";
  }
  element.WriteExtraTraits(out);
  out << "} // namespace vesk\n";
  for (const NameSpace* nameSpace : path) out << "namespace " << nameSpace->name << "\n{\n";
}

void ParseType(QrexParser& parser) {
  parser.RequireIObjectImport();
  parser.Advance();
  bool registered = parser.ParseExportModifier();
  bool reflected = registered;
  if (parser.Is(kShiftLeft)) parser.ParseQualifierFlags(reflected, registered, " >> on $type");
  TypeCode code;
  if (!parser.ParseTypeWithName(code, nullptr, false, nullptr, reflected)) {
    parser.Fail("Type expected when read " + Printed(parser.current));
  }
  const std::string type = TypeText(code);
  const Project& project = parser.GetProject();
  const std::string api =
      registered && project.targetType == TargetType::DynamicLinkLibrary ? project.name + "_API " : std::string();
  if (registered) parser.file.typeRegistrations.push_back({code, &parser.Current()});
  parser.out << api << "vesk::ReflectionByteCode _GetReflected(" << type << " const*);\n";
  parser.out << api << "vesk::TypeOps const& _GetTypeOps(" << type << " const*);\n";
  parser.Flush();
  parser.DropBehindCurrent();
  if (!parser.Is(kSemicolon)) {
    parser.Fail("; expected after $type " + type + " when read " + Printed(parser.current));
  }
}

namespace {

void WriteTypeRegistration(TextWriter& out, const TypeRegistration& registration, RegistrationLists& lists) {
  const std::string type = TypeText(registration.code);
  const std::string mangled = MangledType(registration.code);
  std::string name;
  for (const NameSpace* nameSpace : EnclosingNameSpaces(registration.scope)) name += nameSpace->name + "::";
  lists.registerNames.push_back(name + mangled);

  NameSpaceFrame frame(out, registration.scope);
  out << "vesk::ReflectionByteCode _GetReflected(" << type << " const*)\n";
  {
    Block body(out);
    StringTable strings;
    WriteTypeByteCode(out, "bc", strings, registration.code);
    WriteStringTable(out, strings, "");
    out << "return vesk::ReflectionByteCode(bc," << (strings.Empty() ? "NULL" : "_stringTable") << ");\n";
  }
  out << "vesk::TypeOps const& _GetTypeOps(" << type << " const*)\n";
  {
    Block body(out);
    out << "static vesk::TypeOps typeOps =\n";
    {
      Block record(out, ";");
      WriteTypeOps(out, type, kOpsAll);
    }
    out << "return typeOps;\n";
  }
  out << "void _Register_" << mangled << "()\n";
  Block body(out);
  out << "vxVerify(vesk::RegisterTypeOps(vesk::ReflectionByteCodeValue(_GetReflected((" << type
      << "*)0)),&_GetTypeOps((" << type << "*)0)));\n";
}

void WriteTail(ScannedFile& file, TextWriter& out, RegistrationLists& lists) {
  file.registered = true;
  file.rootNameSpace->WriteReflection(out, lists);
  for (const TypeRegistration& registration : file.typeRegistrations) WriteTypeRegistration(out, registration, lists);
  lists.registerNames.insert(lists.registerNames.end(), file.registerNames.begin(), file.registerNames.end());
  lists.unregisterNames.insert(lists.unregisterNames.end(), file.unregisterNames.begin(), file.unregisterNames.end());
}

// "a::b::N" as its name spaces and its last part.
std::vector<std::string_view> PathParts(std::string_view qualifiedName) {
  std::vector<std::string_view> parts;
  for (size_t colons; (colons = qualifiedName.find("::")) != std::string_view::npos;
       qualifiedName.remove_prefix(colons + 2)) {
    parts.push_back(qualifiedName.substr(0, colons));
  }
  parts.push_back(qualifiedName);
  return parts;
}

void WriteRegistrarDeclaration(TextWriter& out, std::string_view keyword, std::string_view qualifiedName) {
  const std::vector<std::string_view> parts = PathParts(qualifiedName);
  for (size_t i = 0; i + 1 < parts.size(); ++i) out << "namespace " << parts[i] << " { ";
  out << "void _" << keyword << "_" << parts.back() << "(); ";
  for (size_t i = 0; i + 1 < parts.size(); ++i) out << "}";
  out << "\n";
}

void WriteRegistrarCall(TextWriter& out, std::string_view keyword, std::string_view qualifiedName) {
  const std::vector<std::string_view> parts = PathParts(qualifiedName);
  for (size_t i = 0; i + 1 < parts.size(); ++i) out << parts[i] << "::";
  out << "_" << keyword << "_" << parts.back() << "();\n";
}

std::vector<const Project*> RegisteredDependencies(const Project& project) {
  std::vector<const Project*> dependencies;
  for (const std::string& path : project.subprojects) {
    const Project* dependency = project.workspace->FindSubproject(path);
    if (dependency && dependency->usesQrex && IsLibrary(dependency->targetType)) dependencies.push_back(dependency);
  }
  return dependencies;
}

}  // namespace

void WriteReflectionTails(ScannedFile& file, TextWriter& out) {
  RegistrationLists lists;
  const ProjectFile& source = file.file;
  bool wroteHeader = false;
  for (ScannedFile* import : file.imports) {
    if (import->registered || !MayHoldTail(source, import->file)) continue;
    WriteTail(*import, out, lists);
    file.newTails.push_back(import);
    wroteHeader = wroteHeader || &import->file == source.pairedHeader;
  }
  if (source.pairedHeader && !wroteHeader) {
    TraceWriter() << file.SourcePath() << "(1) : warning : cpp file doesn't directly import header with same name\n";
  }
  WriteTail(file, out, lists);
  file.host.RegisterMap().Update(source.path, lists.registerNames);
  file.host.UnregisterMap().Update(source.path, lists.unregisterNames);
}

void WriteProjectRegistration(const ScannedFile& mainFile, const DeclarationRegistry& registry, TextWriter& out) {
  const Project& project = *mainFile.file.project;
  const std::string_view keyword = registry.isRegister ? "Register" : "Unregister";
  const bool onWindows = mainFile.host.Settings().systemName == "Windows";
  const std::vector<const Project*> dependencies = RegisteredDependencies(project);
  out << "\n";
  for (const Project* dependency : dependencies) {
    if (dependency->targetType == TargetType::DynamicLinkLibrary) {
      out << "extern \"C\" ";
      if (onWindows) out << "__declspec(dllimport) ";
    }
    out << "void " << keyword << "_Project_" << dependency->name << "();\n";
  }
  out << "\n";
  for (const auto& [path, names] : registry.entries) {
    for (const std::string& name : names) WriteRegistrarDeclaration(out, keyword, name);
  }
  out << "\n";
  if (project.targetType == TargetType::DynamicLinkLibrary) {
    out << "extern \"C\" ";
    if (onWindows) out << "_declspec(dllexport) ";
  }
  out << "void " << keyword << "_Project_" << project.name << "()\n";
  Block body(out);
  out << "static bool s_called = false;\n";
  out << "if (s_called) return;\n";
  out << "s_called = true;\n";
  for (const Project* dependency : dependencies) out << keyword << "_Project_" << dependency->name << "();\n";
  for (const auto& [path, names] : registry.entries) {
    for (const std::string& name : names) WriteRegistrarCall(out, keyword, name);
  }
}

}  // namespace qrex
