// Linker, librarian, manifest tool.

#include <algorithm>
#include <set>

#include "builder/run_command.h"
#include "builder/tool_names.h"
#include "builder/tools.h"
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

// The names in double quotes in the linker switches: libraries, unless they are switches or, with a `$`,
// left to make files.
std::vector<std::string> QuotedLibraries(const ProjectConfig& config) {
  std::vector<std::string> libraries;
  for (const std::string& token : LinkerTokens(config.linkerText)) {
    if (!IsQuoted(token)) continue;
    std::string name = ForConfiguration(Unquoted(token), config);
    const bool isSwitch = name.starts_with('-') && !name.starts_with("-l");
    if (!isSwitch && name.find('$') == std::string::npos) libraries.push_back(std::move(name));
  }
  return libraries;
}

// A static library leaves the libraries that it names to what it is linked into.
std::vector<std::string> LibrariesOfSubprojects(const ProjectBuilder& builder) {
  std::vector<std::string> libraries;
  if (builder.project.targetType == TargetType::StaticLibrary) return libraries;
  const GccLibraries subprojects(builder.project);
  for (const Project* subproject : subprojects.Order()) {
    if (subproject->targetType != TargetType::StaticLibrary) continue;
    const ProjectConfig* config = subproject->FindConfig(builder.config.name, builder.config.platform);
    if (!config) continue;
    const std::vector<std::string> named = QuotedLibraries(*config);
    libraries.insert(libraries.end(), named.begin(), named.end());
  }
  return libraries;
}

std::string GccLinkerText(const ProjectBuilder& builder, const std::string& target,
                          const std::vector<std::string>& inputs) {
  std::string text;
  if (builder.project.targetType != TargetType::StaticLibrary) {
    text += "-o " + QuotedInput(builder.settings, target);
    if (builder.project.targetType == TargetType::DynamicLinkLibrary) {
      const std::string name(FileNameOf(target));
      const bool isOneWord = name.find(',') == std::string::npos;  // a comma would end it behind -Wl
      text += " -shared " + (isOneWord ? Quoted(builder.settings, "-Wl,-soname," + name)
                                       : "-Xlinker -soname -Xlinker " + Quoted(builder.settings, name));
    }
  }
  for (const std::string& input : inputs) text += " " + QuotedInput(builder.settings, input);
  if (builder.project.targetType == TargetType::StaticLibrary) return text;
  for (const std::string& library : LibrariesOfSubprojects(builder)) text += " \"" + library + "\"";
  text += " -Xlinker -rpath -Xlinker '$ORIGIN'";  // the targets of a configuration share a folder, wherever it is moved
  for (const std::string& token : LinkerTokens(builder.config.linkerText)) {
    std::string word = ForConfiguration(token, builder.config);
    ReplaceAllInPlace(word, "$$", "$");  // as make reads it, for which the switches are written as well
    text += " " + word;
  }
  return text;
}

std::string LinkCommand(const ProjectBuilder& builder, const std::string& target) {
  const bool isStatic = builder.project.targetType == TargetType::StaticLibrary;
  const Compiler& compiler = CompilerOf(builder.settings.compiler);
  if (!isStatic) return std::string(compiler.link);
  const std::string command(compiler.archive);
  if (compiler.family != CompilerFamily::Gcc) return command;
  return command + " \"" + AsInput(builder.settings, target) + "\"";
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

std::vector<std::string> LibrariesOfSwitches(const ProjectBuilder& builder) {
  if (!IsGccFamily(builder.settings.compiler) || builder.project.targetType == TargetType::StaticLibrary) return {};
  std::vector<std::string> libraries = LibrariesOfSubprojects(builder);
  const std::vector<std::string> own = QuotedLibraries(builder.config);
  libraries.insert(libraries.end(), own.begin(), own.end());
  return libraries;
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

namespace {

std::string LinkerResponseFile(const ProjectBuilder& builder) {
  return builder.IntermediateDirectory() + "/linker.rsp";
}
std::string ManifestResponseFile(const ProjectBuilder& builder) { return builder.IntermediateDirectory() + "/mt.rsp"; }
std::string ManifestBatchFile(const ProjectBuilder& builder) { return builder.IntermediateDirectory() + "/mtdep.bat"; }

}  // namespace

// A target without its manifest must not pass for a good one.
bool MakeTarget(ProjectBuilder& builder, const std::string& target, const std::vector<std::string>& inputs) {
  try {
    ToolOutputs outputs(builder.settings, {target},
                        {LinkerResponseFile(builder), ManifestResponseFile(builder), ManifestBatchFile(builder)});
    if (!LinkTarget(builder, target, inputs)) return false;
    if (CompilerOf(builder.settings.compiler).embedsManifest && !EmbedManifest(builder)) return false;
    return outputs.Keep();
  } catch (const FileException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
  }
  ++builder.errorCount;
  return false;
}

bool LinkTarget(ProjectBuilder& builder, const std::string& target, const std::vector<std::string>& inputs) {
  const std::string responseFile = LinkerResponseFile(builder);
  const bool isGcc = IsGccFamily(builder.settings.compiler);
  if (!ToolsTake(builder, {target, responseFile})) return false;
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
    linked = RunCommand(builder.settings.tools, LinkCommand(builder, target) + " @\"" + responseFile + "\"", returnCode,
                        options);
    if (!linked) TraceWriter() << responseFile << ": " << text << "\n";
  } catch (const FileException&) {
    TraceWriter() << "Error writing " << text << " - linking failed\n";
  }
  if (linked) return true;
  HintAtUnbuiltLibraries(builder);
  ++builder.errorCount;
  return false;
}

// --- Manifest

namespace {

bool RunManifestCommand(const ProjectBuilder& builder, const std::string& command) {
  CommandOptions options;
  options.echo = builder.settings.diagnostics;
  options.failOnNonZero = true;
  int returnCode;
  return RunCommand(builder.settings.tools, command, returnCode, options);
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
  const CommandFile response(builder.settings.leftovers, ManifestResponseFile(builder), text);
  if (builder.settings.diagnostics) TraceWriter() << "Embedding manifest...\n" << text;
  return RunManifestCommand(builder, "mt.exe @\"" + response.Path() + "\" /nologo");
}

// Leaves a mark of the last update beside the objects.
bool MarkManifestTime(const ProjectBuilder& builder) {
  std::string directory;
  ReplaceChar(builder.IntermediateDirectory(), directory, '/', '\\');
  const CommandFile batch(builder.settings.leftovers, ManifestBatchFile(builder),
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
