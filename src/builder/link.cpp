// Linker, librarian, manifest tool.

#include <algorithm>
#include <set>

#include "builder/build_step.h"
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
    text += "-o " + QuotedInput(builder.settings.compiler, target);
    if (builder.project.targetType == TargetType::DynamicLinkLibrary) {
      const std::string name(FileNameOf(target));
      const bool isOneWord = name.find(',') == std::string::npos;  // a comma would end it behind -Wl
      text += " -shared " + (isOneWord ? Quoted(builder.settings.compiler, "-Wl,-soname," + name)
                                       : "-Xlinker -soname -Xlinker " + Quoted(builder.settings.compiler, name));
    }
  }
  for (const std::string& input : inputs) text += " " + QuotedInput(builder.settings.compiler, input);
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
  return command + " \"" + AsInput(builder.settings.compiler, target) + "\"";
}

}  // namespace

std::vector<std::string> CollectLinkInputs(ProjectBuilder& builder) {
  const Project& project = builder.project;
  const bool isGcc = IsGccFamily(builder.settings.compiler);
  std::vector<std::string> inputs;
  for (const ScannedFile* file : builder.scanned) {
    if (HasObject(file->file)) {
      inputs.push_back(builder.paths.Object(file->file));
    } else if (file->file.kind == FileKind::Rc && !project.libraryIsStatic && !isGcc) {
      inputs.push_back(builder.paths.ResourceObject(file->file));
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

std::string ResponseText(const ProjectBuilder& builder, const std::string& target,
                         const std::vector<std::string>& inputs) {
  return IsGccFamily(builder.settings.compiler) ? GccLinkerText(builder, target, inputs)
                                                : VisualLinkerText(builder, inputs);
}

// Linker or librarian; then, for those compilers, the manifest tool and a mark of the time of its update.
class LinkStep : public BuildStep {
 public:
  LinkStep(ProjectBuilder& builder, std::string target, std::vector<std::string> inputs)
      : m_builder(builder),
        m_target(std::move(target)),
        m_inputs(std::move(inputs)),
        m_responseFile(builder.paths.Intermediate() + "/linker.rsp"),
        m_manifestFile(builder.paths.Intermediate() + "/mt.rsp"),
        m_batchFile(builder.paths.Intermediate() + "/mtdep.bat") {}

  std::optional<Command> Prepare() override {
    try {
      switch (m_stage) {
        case Stage::Link:
          return PrepareLink();
        case Stage::Manifest:
          return PrepareManifest();
        case Stage::Mark:
          return PrepareMark();
        case Stage::Over:
          break;
      }
    } catch (const FileException& exception) {
      TraceWriter() << "Error: " << exception << "\n";
      Fail();
    }
    return std::nullopt;
  }

  ToolTask Task() const override {
    const ToolKind kind = m_stage == Stage::Link ? ToolKind::Linker : ToolKind::ManifestTool;
    return {kind, m_builder.project.name, {}, m_target, m_inputs};
  }

  void Finish(const CommandResult& result) override {
    m_commandFile.reset();
    if (!result.succeeded) {
      if (m_stage != Stage::Link) return Fail();
      TraceWriter() << m_responseFile << ": " << m_linkerText << "\n";
      return FailLink();
    }
    if (m_stage == Stage::Manifest) {
      m_stage = Stage::Mark;
    } else if (m_stage == Stage::Link && EmbedsManifest()) {
      m_stage = Stage::Manifest;
    } else {
      m_hasSucceeded = true;
      m_outputs->Keep();
      End();
    }
  }

 private:
  enum class Stage { Link, Manifest, Mark, Over };

  bool EmbedsManifest() const {
    return CompilerOf(m_builder.settings.compiler).embedsManifest &&
           m_builder.project.targetType != TargetType::StaticLibrary;
  }
  void End() {
    m_stage = Stage::Over;
    m_outputs.reset();
  }
  void Fail() {
    ++m_builder.errorCount;
    End();
  }
  void FailLink() {
    HintAtUnbuiltLibraries(m_builder);
    Fail();
  }
  Command Checked(std::string line) const {
    return {.line = std::move(line), .echo = m_builder.settings.diagnostics, .failOnNonZero = true};
  }
  std::optional<Command> PrepareLink();
  std::optional<Command> PrepareManifest();
  std::optional<Command> PrepareMark();

  ProjectBuilder& m_builder;
  const std::string m_target;
  const std::vector<std::string> m_inputs;
  const std::string m_responseFile, m_manifestFile, m_batchFile;
  std::string m_linkerText;
  Stage m_stage = Stage::Link;
  std::optional<ToolOutputs> m_outputs;
  std::optional<CommandFile> m_commandFile;
};

std::optional<Command> LinkStep::PrepareLink() {
  m_outputs.emplace(m_builder.settings, std::vector{m_target},
                    std::vector{m_responseFile, m_manifestFile, m_batchFile});
  if (!ToolsTake(m_builder, {m_target, m_responseFile})) {
    End();
    return std::nullopt;
  }
  const bool isGcc = IsGccFamily(m_builder.settings.compiler);
  m_linkerText = ResponseText(m_builder, m_target, m_inputs);
  CreateDirectories(m_target, false);
  try {
    RemoveLink(m_target);
    m_commandFile.emplace(m_builder.settings.leftovers, m_responseFile, m_linkerText);
    TraceWriter() << "Linking...\n";
    if (m_builder.settings.diagnostics) TraceWriter() << m_responseFile << " = " << m_linkerText << "\n";
    if (isGcc) DeleteFile(m_target);  // an archive would keep members of objects that are gone
  } catch (const FileException&) {
    m_commandFile.reset();
    TraceWriter() << "Error writing " << m_linkerText << " - linking failed\n";
    FailLink();
    return std::nullopt;
  }
  return Checked(LinkCommand(m_builder, m_target) + " @\"" + m_responseFile + "\"");
}

std::optional<Command> LinkStep::PrepareManifest() {
  const Project& project = m_builder.project;
  const bool isDll = project.targetType == TargetType::DynamicLinkLibrary;
  const bool isProgram =
      project.targetType == TargetType::Application || project.targetType == TargetType::ConsoleApplication;
  const std::string name = project.name + (isDll ? ".dll" : isProgram ? ".exe" : ".");
  const std::string_view resource = isDll ? "2" : isProgram ? "1" : "0";
  const std::string text = "/outputresource:\"" + m_builder.paths.Library() + "/" + name + "\";#" +
                           std::string(resource) + " /manifest \"./" + m_builder.paths.Intermediate() + "/" + name +
                           ".intermediate.manifest\"\n";
  m_commandFile.emplace(m_builder.settings.leftovers, m_manifestFile, text);
  if (m_builder.settings.diagnostics) TraceWriter() << "Embedding manifest...\n" << text;
  return Checked("mt.exe @\"" + m_manifestFile + "\" /nologo");
}

// Leaves a mark of the last update beside the objects.
std::optional<Command> LinkStep::PrepareMark() {
  std::string directory;
  ReplaceChar(m_builder.paths.Intermediate(), directory, '/', '\\');
  m_commandFile.emplace(m_builder.settings.leftovers, m_batchFile,
                        "@echo Manifest resource last updated at %TIME% on %DATE% >\"" + directory + "\\mt.dep\"\n");
  return Checked("\"" + directory + "\\mtdep.bat\"");
}

}  // namespace

std::string LinkText(const ProjectBuilder& builder, const std::string& target, const std::vector<std::string>& inputs) {
  return LinkCommand(builder, target) + "\n" + ResponseText(builder, target, inputs);
}

std::unique_ptr<BuildStep> TargetStep(ProjectBuilder& builder, std::string target, std::vector<std::string> inputs) {
  return std::make_unique<LinkStep>(builder, std::move(target), std::move(inputs));
}

}  // namespace qrex
