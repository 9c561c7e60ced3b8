// Linker, librarian, manifest tool.

#include <algorithm>

#include "build/run_command.h"
#include "build/tools.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "workspace/linker_text.h"

namespace qrex {

namespace {

std::string GccTargetName(const Project& project) {
  switch (project.targetType) {
    case TargetType::StaticLibrary:
      return "lib" + project.name + ".a";
    case TargetType::DynamicLinkLibrary:
      return "lib" + project.name + ".so";
    default:
      return project.name;
  }
}

// The libraries of the gcc family, dependents ahead of what they depend on.
void AddGccLibraries(const ProjectBuilder& builder, const Project& project, std::vector<const Project*>& libraries) {
  for (const std::string& path : project.subprojects) {
    const Project* subproject = project.workspace->FindSubproject(path);
    if (!subproject || !IsLibrary(subproject->targetType)) continue;
    const bool isNew = std::find(libraries.begin(), libraries.end(), subproject) == libraries.end();
    std::erase(libraries, subproject);  // what is needed by a later one stands behind it
    libraries.push_back(subproject);
    if (isNew) AddGccLibraries(builder, *subproject, libraries);
  }
}

std::string GccLibraryPath(const ProjectBuilder& builder, const Project& library) {
  const std::string& root = library.exported ? library.rootDir : builder.settings.exportLib;
  return PathJoin(PathJoin3(root, builder.config.platform, builder.config.name), GccTargetName(library));
}

std::string ForConfiguration(std::string text, const ProjectConfig& config) {
  ReplaceAllInPlace(text, "$(Platform)", config.platform);
  ReplaceAllInPlace(text, "$(Configuration)", config.name);
  return text;
}

bool HasWholeProgramOptimization(const ProjectConfig& config) {
  auto found = config.generalOptions.find("WholeProgramOptimization");
  return found != config.generalOptions.end() && found->second == "1";
}

std::string VisualLinkerText(const ProjectBuilder& builder, const std::vector<std::string>& inputs) {
  std::string text;
  bool hasLtcg = false;
  for (const std::string& token : LinkerTokens(builder.config.linkerText)) {
    if (token.front() != '/') continue;
    text += " " + ForConfiguration(token, builder.config);
    hasLtcg = hasLtcg || EqualIgnoringCase(token, "/LTCG");
  }
  if (!hasLtcg && HasWholeProgramOptimization(builder.config)) text += " /LTCG";
  for (const std::string& input : inputs) text += " \"" + ForConfiguration(input, builder.config) + "\"";
  return text;
}

std::string GccLinkerText(const ProjectBuilder& builder, const std::string& target,
                          const std::vector<std::string>& inputs) {
  std::string text;
  if (builder.project.targetType != TargetType::StaticLibrary) {
    text += "-o \"" + target + "\"";
    if (builder.project.targetType == TargetType::DynamicLinkLibrary) text += " -shared";
  }
  for (const std::string& input : inputs) text += " \"" + input + "\"";
  if (builder.project.targetType == TargetType::StaticLibrary) return text;
  std::string libraryDirectory;
  if (FullPathOf(builder.LibraryDirectory(), libraryDirectory)) text += " \"-Wl,-rpath," + libraryDirectory + "\"";
  for (const std::string& token : LinkerTokens(builder.config.linkerText)) text += " " + token;
  return text;
}

std::string LinkCommand(const ProjectBuilder& builder, const std::string& target) {
  const bool isStatic = builder.project.targetType == TargetType::StaticLibrary;
  switch (builder.settings.compiler) {
    case CompilerKind::gcc:
      return isStatic ? "ar rcs \"" + target + "\"" : "g++";
    case CompilerKind::clang:
      return isStatic ? "ar rcs \"" + target + "\"" : "clang++";
    case CompilerKind::winegcc:
      return isStatic ? "ar rcs \"" + target + "\"" : "wineg++";
    default:
      return isStatic ? "lib.exe" : "link.exe";
  }
}

}  // namespace

std::string TargetPath(const ProjectBuilder& builder) {
  const Project& project = builder.project;
  const std::string name = IsGccFamily(builder.settings.compiler)
                               ? GccTargetName(project)
                               : project.name + "." + std::string(TargetTypeExtension(project.targetType));
  return builder.LibraryDirectory() + "/" + name;
}

std::vector<std::string> CollectLinkInputs(ProjectBuilder& builder) {
  const Project& project = builder.project;
  const bool isGcc = IsGccFamily(builder.settings.compiler);
  std::vector<std::string> inputs;
  for (const ScannedFile* file : builder.scanned) {
    const FileKind kind = file->file.kind;
    if (kind == FileKind::C || kind == FileKind::Cpp || kind == FileKind::Asm) {
      inputs.push_back(ObjectPath(builder, file->file));
    } else if (kind == FileKind::Rc && !project.libraryIsStatic && !isGcc) {
      inputs.push_back(ResourceObjectPath(builder, file->file));
    }
  }
  if (project.targetType == TargetType::StaticLibrary) return inputs;
  if (isGcc) {
    std::vector<const Project*> libraries;
    AddGccLibraries(builder, project, libraries);
    for (const Project* library : libraries) inputs.push_back(GccLibraryPath(builder, *library));
  } else {
    std::set<std::string> libraries;
    GatherLibraries(project, builder.config, LibraryChoice(), libraries);
    inputs.insert(inputs.end(), libraries.begin(), libraries.end());
  }
  return inputs;
}

bool LinkTarget(ProjectBuilder& builder, const std::string& target, const std::vector<std::string>& inputs) {
  const std::string responseFile = builder.IntermediateDirectory() + "/linker.rsp";
  const bool isGcc = IsGccFamily(builder.settings.compiler);
  const std::string text = isGcc ? GccLinkerText(builder, target, inputs) : VisualLinkerText(builder, inputs);
  try {
    ReplaceFile(responseFile, WithCarriageReturns(text));
  } catch (const FileException&) {
    TraceWriter() << "Error writing " << text << " - linking failed\n";
    ++builder.errorCount;
    return false;
  }
  TraceWriter() << "Linking...\n";
  if (builder.settings.diagnostics) TraceWriter() << responseFile << " = " << text << "\n";
  if (isGcc) DeleteFile(target);  // an archive would keep members of objects that are gone
  CommandOptions options;
  options.echo = builder.settings.diagnostics;
  options.failOnNonZero = true;
  int returnCode;
  const bool linked = RunCommand(LinkCommand(builder, target) + " @\"" + responseFile + "\"", returnCode, options);
  if (!linked) {
    ++builder.errorCount;
    TraceWriter() << responseFile << ": " << text << "\n";
  }
  DeleteFile(responseFile);
  return linked;
}

// --- Manifest

namespace {

bool UpdateManifest(const ProjectBuilder& builder) {
  const Project& project = builder.project;
  const bool isDll = project.targetType == TargetType::DynamicLinkLibrary;
  const bool isProgram =
      project.targetType == TargetType::Application || project.targetType == TargetType::ConsoleApplication;
  const std::string_view number = isDll ? "2" : isProgram ? "1" : "0";
  const std::string_view extension = isDll ? "dll" : isProgram ? "exe" : "";
  const std::string directory = builder.IntermediateDirectory();
  const std::string responseFile = directory + "/mt.rsp";
  MemoryTextWriter text;
  text << "/outputresource:\"" << builder.LibraryDirectory() << "/" << project.name << "." << extension << "\";#"
       << number << " /manifest \"./" << directory << "/" << project.name << "." << extension
       << ".intermediate.manifest\"\n";
  const std::string response = text.TakeText();
  ReplaceFile(responseFile, WithCarriageReturns(response));
  if (builder.settings.diagnostics) TraceWriter() << "Embedding manifest...\n" << response;
  CommandOptions options;
  options.echo = builder.settings.diagnostics;
  options.failOnNonZero = true;
  int returnCode;
  const bool updated = RunCommand("mt.exe @\"" + responseFile + "\" /nologo", returnCode, options);
  DeleteFile(responseFile);
  return updated;
}

// Leaves a mark of the last update beside the objects.
bool MarkManifestTime(const ProjectBuilder& builder) {
  std::string directory;
  ReplaceChar(builder.IntermediateDirectory(), directory, '/', '\\');
  const std::string batchFile = builder.IntermediateDirectory() + "/mtdep.bat";
  ReplaceFile(batchFile, "@echo Manifest resource last updated at %TIME% on %DATE% >\"" + directory + "\\mt.dep\"\r\n");
  CommandOptions options;
  options.echo = builder.settings.diagnostics;
  options.failOnNonZero = true;
  int returnCode;
  const bool marked = RunCommand("\"" + directory + "\\mtdep.bat\"", returnCode, options);
  DeleteFile(batchFile);
  return marked;
}

}  // namespace

bool EmbedManifest(ProjectBuilder& builder, const std::string&) {
  if (builder.project.targetType == TargetType::StaticLibrary) return true;
  try {
    if (UpdateManifest(builder) && MarkManifestTime(builder)) return true;
    ++builder.errorCount;
  } catch (const FileException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
  }
  return false;
}

}  // namespace qrex
