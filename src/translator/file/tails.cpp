#include "translator/file/tails.h"

#include "text/trace.h"
#include "translator/emit/emit.h"
#include "translator/kinds/type_registration.h"
#include "workspace/workspace.h"

namespace qrex {

namespace {

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
