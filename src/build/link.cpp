// Linker, librarian, manifest tool.

#include <algorithm>
#include <set>

#include "build/run_command.h"
#include "build/tools.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/trace.h"
#include "workspace/linker_text.h"
#include "workspace/workspace.h"

namespace qrex {

namespace {

// The libraries of the gcc family, dependents ahead of what they depend on: a walk behind the subprojects, turned
// round. A dynamic library has what it needs linked in; a static one leaves that to its user.
class GccLibraries {
 public:
  explicit GccLibraries(const Project& project) {
    Visit(project);
    m_order.pop_back();  // the project itself
    std::reverse(m_order.begin(), m_order.end());
  }
  const std::vector<const Project*>& Order() const { return m_order; }

 private:
  void Visit(const Project& project) {
    if (!m_seen.insert(&project).second) return;
    const bool isFirst = m_seen.size() == 1;
    if (isFirst || project.targetType == TargetType::StaticLibrary) {
      for (auto path = project.subprojects.rbegin(); path != project.subprojects.rend(); ++path) {
        const Project* subproject = project.workspace->FindSubproject(*path);
        if (subproject && IsLibrary(subproject->targetType)) Visit(*subproject);
      }
    }
    m_order.push_back(&project);
  }

  std::set<const Project*> m_seen;
  std::vector<const Project*> m_order;
};

std::string GccLibraryPath(const ProjectBuilder& builder, const Project& library) {
  const std::string& root = library.exported ? library.rootDir : builder.settings.exportLib;
  const std::string target = GccTargetPath(library, builder.config);
  return PathJoin(PathJoin3(root, builder.config.platform, builder.config.name), FileNameOf(target));
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
    text.append(" ").append(ForConfiguration(token, builder.config));
    hasLtcg = hasLtcg || EqualIgnoringCase(token, "/LTCG");
  }
  if (!hasLtcg && HasWholeProgramOptimization(builder.config)) text += " /LTCG";
  for (const std::string& input : inputs) {
    text.append(" \"").append(ForConfiguration(input, builder.config)).append("\"");
  }
  return text;
}

std::string GccLinkerText(const ProjectBuilder& builder, const std::string& target,
                          const std::vector<std::string>& inputs) {
  std::string text;
  if (builder.project.targetType != TargetType::StaticLibrary) {
    text += "-o \"" + target + "\"";
    if (builder.project.targetType == TargetType::DynamicLinkLibrary) {
      text += " -shared \"-Wl,-soname," + std::string(FileNameOf(target)) + "\"";
    }
  }
  for (const std::string& input : inputs) text += " \"" + input + "\"";
  if (builder.project.targetType == TargetType::StaticLibrary) return text;
  std::string libraryDirectory;
  if (FullPathOf(builder.LibraryDirectory(), libraryDirectory)) {
    text += " -Xlinker -rpath -Xlinker \"" + libraryDirectory + "\"";  // a comma would end the path behind -Wl
  }
  for (const std::string& token : LinkerTokens(builder.config.linkerText)) text += " " + token;
  return text;
}

std::string LinkCommand(const ProjectBuilder& builder, const std::string& target) {
  const bool isStatic = builder.project.targetType == TargetType::StaticLibrary;
  const Compiler& compiler = CompilerOf(builder.settings.compiler);
  if (!isStatic) return std::string(compiler.link);
  const std::string command(compiler.archive);
  return compiler.family == CompilerFamily::Gcc ? command + " \"" + target + "\"" : command;
}

}  // namespace

std::string TargetPath(const ProjectBuilder& builder) {
  const Project& project = builder.project;
  if (IsGccFamily(builder.settings.compiler)) return GccTargetPath(project, builder.config);
  return builder.LibraryDirectory() + "/" + project.name + "." + std::string(TargetTypeExtension(project.targetType));
}

std::vector<std::string> CollectLinkInputs(ProjectBuilder& builder) {
  const Project& project = builder.project;
  const bool isGcc = IsGccFamily(builder.settings.compiler);
  std::vector<std::string> inputs;
  for (const ScannedFile* file : builder.scanned) {
    if (HasObject(file->file)) {
      inputs.push_back(ObjectPath(builder, file->file));
    } else if (file->file.kind == FileKind::Rc && !project.libraryIsStatic && !isGcc) {
      inputs.push_back(ResourceObjectPath(builder, file->file));
    }
  }
  if (project.targetType == TargetType::StaticLibrary) return inputs;
  if (isGcc) {
    const GccLibraries libraries(project);
    for (const Project* library : libraries.Order()) inputs.push_back(GccLibraryPath(builder, *library));
  } else {
    std::set<std::string> libraries;
    GatherLibraries(project, builder.config, LibraryChoice(), libraries);
    inputs.insert(inputs.end(), libraries.begin(), libraries.end());
  }
  return inputs;
}

namespace {

// What is not marked `qrex` is built by others; a link that fails may do so for want of it.
void HintAtUnbuiltLibraries(const ProjectBuilder& builder) {
  const Project& project = builder.project;
  for (const std::string& path : project.subprojects) {
    const Project* library = project.workspace->FindSubproject(path);
    if (!library || library->usesQrex || library->exported || !IsLibrary(library->targetType)) continue;
    if (IsGccFamily(builder.settings.compiler) && LastWriteTime(GccTargetPath(*library, builder.config)) != 0) continue;
    TraceWriter() << Hint(library->filePath + " does not say qrex: this program does not build " + library->name +
                          ", which " + project.name + " links against");
  }
}

}  // namespace

bool LinkTarget(ProjectBuilder& builder, const std::string& target, const std::vector<std::string>& inputs) {
  const std::string responseFile = builder.IntermediateDirectory() + "/linker.rsp";
  const bool isGcc = IsGccFamily(builder.settings.compiler);
  const std::string text = isGcc ? GccLinkerText(builder, target, inputs) : VisualLinkerText(builder, inputs);
  int returnCode = 0;
  bool linked = false;
  CreateDirectories(target, false);
  try {
    RemoveLink(target);
    const CommandFile response(builder.settings.leftovers, responseFile, text);
    TraceWriter() << "Linking...\n";
    if (builder.settings.diagnostics) TraceWriter() << responseFile << " = " << text << "\n";
    if (isGcc) DeleteFile(target);  // an archive would keep members of objects that are gone
    CommandOptions options;
    options.echo = builder.settings.diagnostics;
    options.failOnNonZero = true;
    linked = RunCommand(LinkCommand(builder, target) + " @\"" + responseFile + "\"", returnCode, options);
    if (!linked) TraceWriter() << responseFile << ": " << text << "\n";
  } catch (const FileException&) {
    TraceWriter() << "Error writing " << text << " - linking failed\n";
  }
  if (linked) return true;
  HintAtUnbuiltLibraries(builder);
  ++builder.errorCount;
  if (isGcc || IsAbnormalEnd(returnCode)) DeleteThoughReadOnly(target);  // half a target must not pass for a good one
  return false;
}

// --- Manifest

namespace {

bool RunManifestCommand(const ProjectBuilder& builder, const std::string& command) {
  CommandOptions options;
  options.echo = builder.settings.diagnostics;
  options.failOnNonZero = true;
  int returnCode;
  return RunCommand(command, returnCode, options);
}

bool UpdateManifest(const ProjectBuilder& builder) {
  const Project& project = builder.project;
  const bool isDll = project.targetType == TargetType::DynamicLinkLibrary;
  const bool isProgram =
      project.targetType == TargetType::Application || project.targetType == TargetType::ConsoleApplication;
  const std::string name = project.name + (isDll ? ".dll" : isProgram ? ".exe" : ".");
  const std::string_view resource = isDll ? "2" : isProgram ? "1" : "0";
  const std::string directory = builder.IntermediateDirectory();
  const std::string text = "/outputresource:\"" + builder.LibraryDirectory() + "/" + name + "\";#" +
                           std::string(resource) + " /manifest \"./" + directory + "/" + name +
                           ".intermediate.manifest\"\n";
  const CommandFile response(builder.settings.leftovers, directory + "/mt.rsp", text);
  if (builder.settings.diagnostics) TraceWriter() << "Embedding manifest...\n" << text;
  return RunManifestCommand(builder, "mt.exe @\"" + response.Path() + "\" /nologo");
}

// Leaves a mark of the last update beside the objects.
bool MarkManifestTime(const ProjectBuilder& builder) {
  std::string directory;
  ReplaceChar(builder.IntermediateDirectory(), directory, '/', '\\');
  const CommandFile batch(builder.settings.leftovers, builder.IntermediateDirectory() + "/mtdep.bat",
                          "@echo Manifest resource last updated at %TIME% on %DATE% >\"" + directory + "\\mt.dep\"\n");
  return RunManifestCommand(builder, "\"" + directory + "\\mtdep.bat\"");
}

}  // namespace

bool EmbedManifest(ProjectBuilder& builder) {
  if (builder.project.targetType == TargetType::StaticLibrary) return true;
  try {
    if (UpdateManifest(builder) && MarkManifestTime(builder)) return true;
  } catch (const FileException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
  }
  ++builder.errorCount;
  return false;
}

}  // namespace qrex
