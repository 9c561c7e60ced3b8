// The steps of linker, librarian and manifest tool.

#include "builder/build_step.h"
#include "builder/target_command.h"
#include "builder/tool_names.h"
#include "builder/tools.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/trace.h"
#include "workspace/workspace.h"

namespace qrex {

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
  const TargetCommand command = TargetCommandOf(m_builder.project, m_builder.config, m_target, m_inputs);
  m_linkerText = command.text;
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
  return Checked(command.tool + " @\"" + m_responseFile + "\"");
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

std::unique_ptr<BuildStep> TargetStep(ProjectBuilder& builder, std::string target, std::vector<std::string> inputs) {
  return std::make_unique<LinkStep>(builder, std::move(target), std::move(inputs));
}

}  // namespace qrex
