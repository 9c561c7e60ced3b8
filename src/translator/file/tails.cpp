#include "translator/file/tails.h"

#include "translator/emit/emit.h"
#include "translator/kinds/type_registration.h"
#include "translator/symbols/position_mark.h"
#include "workspace/workspace.h"

namespace qrex {

namespace {

void WriteTail(ScannedFile& file, TextWriter& out, RegistrationLists& lists) {
  file.tail.isRegistered = true;
  file.rootNameSpace->WriteReflection(out, lists);
  const Registrations& own = file.registrations;
  for (const TypeRegistration& registration : own.types) {
    if (file.HasLineDirectives()) out << PositionMark(registration.position);
    WriteTypeRegistration(out, registration, lists);
  }
  lists.registerNames.insert(lists.registerNames.end(), own.registerNames.begin(), own.registerNames.end());
  lists.unregisterNames.insert(lists.unregisterNames.end(), own.unregisterNames.begin(), own.unregisterNames.end());
}

// "a::b::N" taken apart.
struct QualifiedName {
  std::vector<std::string_view> nameSpaces;
  std::string_view name;
};
QualifiedName PartsOf(std::string_view qualifiedName) {
  QualifiedName parts;
  for (size_t colons; (colons = qualifiedName.find("::")) != std::string_view::npos;
       qualifiedName.remove_prefix(colons + 2)) {
    parts.nameSpaces.push_back(qualifiedName.substr(0, colons));
  }
  parts.name = qualifiedName;
  return parts;
}

void WriteRegistrarDeclaration(TextWriter& out, std::string_view keyword, std::string_view qualifiedName) {
  const auto [nameSpaces, name] = PartsOf(qualifiedName);
  Write(out, "$open$void _$keyword$_$name$(); $close$\n",
        "open"_ = Each(out, nameSpaces, "", [&](std::string_view part) { out << "namespace " << part << " { "; }),
        "keyword"_ = keyword, "name"_ = name,
        "close"_ = Each(out, nameSpaces, "", [&](std::string_view) { out << "}"; }));
}

void WriteRegistrarCall(TextWriter& out, std::string_view keyword, std::string_view qualifiedName) {
  const auto [nameSpaces, name] = PartsOf(qualifiedName);
  Write(out, "$scope$_$keyword$_$name$();\n",
        "scope"_ = Each(out, nameSpaces, "", [&](std::string_view part) { out << part << "::"; }), "keyword"_ = keyword,
        "name"_ = name);
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
    if (import->tail.isRegistered || !MayHoldTail(source, import->file)) continue;
    WriteTail(*import, out, lists);
    file.tail.written.push_back(import);
    wroteHeader = wroteHeader || &import->file == source.pairedHeader;
  }
  if (source.pairedHeader && !wroteHeader) {
    file.host.Tell(Message(Severity::Warning, "warning : ", "cpp file doesn't directly import header with same name")
                       .At({file.SourcePath(), 1}));
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
  auto linkage = [&](const Project& declared, std::string_view windowsSpecifier) {
    if (declared.targetType != TargetType::DynamicLinkLibrary) return;
    out << "extern \"C\" " << If(onWindows, windowsSpecifier);
  };
  auto declaration = [&](const Project* dependency) {
    Write(out, "$linkage$void $keyword$_Project_$name$();\n",
          "linkage"_([&] { linkage(*dependency, "__declspec(dllimport) "); }), "keyword"_ = keyword,
          "name"_ = dependency->name);
  };
  auto call = [&](const Project* dependency) {
    Write(out, "$keyword$_Project_$name$();\n", "keyword"_ = keyword, "name"_ = dependency->name);
  };
  auto eachRegistrar = [&](auto write) {
    return Each(out, registry.entries, "", [&, write](const auto& entry) {
      for (const std::string& name : entry.second) write(out, keyword, name);
    });
  };
  Write(out, R"(

    $dependencies$

    $registrars$

    $linkage$void $keyword$_Project_$name$()
    {
        static bool s_called = false;
        if (s_called) return;
        s_called = true;
        $dependencyCalls$
        $registrarCalls$
    }
  )",
        "dependencies"_ = Each(out, dependencies, "", declaration),
        "registrars"_ = eachRegistrar(WriteRegistrarDeclaration),
        "linkage"_([&] { linkage(project, "_declspec(dllexport) "); }), "keyword"_ = keyword, "name"_ = project.name,
        "dependencyCalls"_ = Each(out, dependencies, "", call), "registrarCalls"_ = eachRegistrar(WriteRegistrarCall));
}

}  // namespace qrex
