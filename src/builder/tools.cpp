// Compilers, assembler, resource compiler. The linker is in link.cpp.

#include "builder/tools.h"

#include <utility>

#include "builder/build_step.h"
#include "builder/source_command.h"
#include "builder/tool_names.h"
#include "builder/tool_output.h"
#include "platform/interpreter.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/trace.h"
#include "workspace/switch_blocks.h"

namespace qrex {

namespace {

// Where a step puts what its tool reads. Steps that may run at once must not share it.
std::string ResponseFile(const ProjectBuilder& builder, const SourceCommand& command) {
  if (builder.scheduler.Overlaps()) return command.object + ".rsp";
  return builder.paths.Intermediate() + "/" + std::string(command.name) + ".rsp";
}

// A compiler or assembler makes an object. Its output decides; the return code matters only where it says that the tool
// did not come to its own end and, in the gcc family, that it failed without a message of the known forms.
class SourceStep : public BuildStep {
 public:
  SourceStep(ProjectBuilder& builder, const ProjectFile& file, std::string hint)
      : m_builder(builder),
        m_file(file),
        m_command(SourceCommandOf(builder.project, builder.config, file)),
        m_responseFile(ResponseFile(builder, m_command)),
        m_hint(std::move(hint)) {}

  std::optional<Command> Prepare() override {
    if (std::exchange(m_hasBegun, true)) return std::nullopt;
    const ConfigSettings& settings = m_builder.settings;
    const std::string_view verb = m_file.kind == FileKind::Asm ? "Assembling " : "Compiling ";
    if (settings.diagnostics) TraceWriter() << verb << m_file.path << "\n";
    if (!ToolsTake(m_builder, {m_command.input, m_command.object})) return std::nullopt;
    RemoveLink(m_command.object);
    const bool hasFile = m_command.hasFile || IsTooLong();
    try {
      m_outputs.emplace(settings, std::vector{m_command.object}, std::vector{m_responseFile});
      if (hasFile) {
        if (settings.diagnostics) TraceWriter() << m_responseFile << " = " << m_command.text << "\n";
        m_response.emplace(settings.leftovers, m_responseFile, m_command.text);
      }
    } catch (const FileException& exception) {
      TraceWriter() << "Error: " << exception << "\n";
      m_outputs.reset();
      CountFailure();
      return std::nullopt;
    }
    const std::string file = hasFile ? m_responseFile : std::string();
    const bool hasWords = !hasFile || HasLauncher();
    return Command{.line = m_command.Line(file),
                   .words = hasWords ? m_command.Words(settings.compiler, file) : std::vector<std::string>(),
                   .echo = settings.diagnostics,
                   .capturesOutput = true,
                   .errorsIntoOutput = IsGcc()};  // where that family writes its messages
  }

  ToolTask Task() const override {
    return {m_file.kind == FileKind::Asm ? ToolKind::Assembler : ToolKind::Compiler,
            m_builder.project.name,
            m_file.path,
            m_command.object,
            {m_command.input}};
  }

  void Finish(const CommandResult& result) override {
    if (!result.succeeded && m_response) TraceWriter() << m_responseFile << ": " << m_command.text << "\n";
    m_response.reset();
    const std::string_view launcher = HasLauncher() ? FileNameOf(m_command.launcher.front()) : std::string_view();
    const ToolMessages found = ScanToolOutput(m_builder, result.output, launcher);
    m_builder.errorCount += found.errors;
    m_builder.warningCount += found.warnings;
    const bool endedItself = result.succeeded && result.end.IsNormal();
    // Of a launcher one knows no better what a code means that is not 0, whatever compiler it was to run.
    const bool codeCounts = IsGcc() || HasLauncher();
    m_hasSucceeded = endedItself && found.errors == 0 && !(codeCounts && result.ReturnCode() != 0);
    // A tool that came to its own end clears away what it could not finish; gcc's driver may have been the one to end.
    if (m_hasSucceeded || (endedItself && !codeCounts)) m_outputs->Keep();
    m_outputs.reset();
    if (m_hasSucceeded) return;
    if (found.errors == 0 && codeCounts && result.ReturnCode() != 0) {
      TraceWriter() << "Return code : " << result.ReturnCode() << "\n";
      if (HasLauncher()) TellMissingCompiler();
    }
    CountFailure(found.errors);
  }

 private:
  bool IsGcc() const { return IsGccFamily(m_builder.settings.compiler); }
  bool HasLauncher() const { return !m_command.launcher.empty(); }
  // The command line that was asked for, so that the text goes to a file after all.
  bool IsTooLong() {
    if (platform::FitsCommandLine(m_command.Words(m_builder.settings.compiler, ""))) return false;
    if (std::exchange(m_builder.settings.hasToldOfLongCommand, true)) return true;
    TraceWriter() << "Warning: What compiles " << m_file.path
                  << " is longer than the system's command lines: it is put into a file, there and wherever it is\n";
    return true;
  }
  void TellMissingCompiler() {
    const std::string program = m_command.Program();
    if (!platform::FindProgram(platform::NameHere(program)).empty()) return;
    TraceWriter() << "ERROR: " << program << " was not found on PATH, which " << m_command.launcher.front()
                  << " is to run\n";
  }
  void CountFailure(int64_t errors = 0) {
    if (errors == 0) ++m_builder.errorCount;
    if (!m_hint.empty()) TraceWriter() << Hint(m_hint);
  }

  ProjectBuilder& m_builder;
  const ProjectFile& m_file;
  const SourceCommand m_command;
  const std::string m_responseFile;
  const std::string m_hint;  // if it fails
  std::optional<ToolOutputs> m_outputs;
  std::optional<CommandFile> m_response;
  bool m_hasBegun = false;
};

bool IsFirstOfItsKind(const ProjectBuilder& builder, const ScannedFile& scanned) {
  for (const ScannedFile* file : builder.scanned) {
    if (file->file.kind == scanned.file.kind) return file == &scanned;
  }
  return false;
}

class ResourceObjectStep : public BuildStep {
 public:
  ResourceObjectStep(ProjectBuilder& builder, const ScannedFile& file)
      : m_builder(builder), m_file(file), m_output(builder.paths.ResourceObject(file.file)) {}

  std::optional<Command> Prepare() override {
    if (std::exchange(m_hasBegun, true)) return std::nullopt;
    MemoryTextWriter line;
    line << "rc.exe ";
    WriteResourceSwitches(line, m_builder.config);
    line << " /fo\"" << m_output << "\" \"" << m_file.SourcePath() << "\"";
    TraceWriter() << "Compiling resource file " << m_file.file.path << "\n";
    if (!ToolsTake(m_builder, {m_file.SourcePath(), m_output})) return std::nullopt;
    RemoveLink(m_output);
    try {
      m_outputs.emplace(m_builder.settings, std::vector{m_output}, std::vector<std::string>());
    } catch (const FileException& exception) {
      TraceWriter() << "Error: " << exception << "\n";
      ++m_builder.errorCount;
      return std::nullopt;
    }
    return Command{.line = line.TakeText(), .echo = m_builder.settings.diagnostics, .failOnNonZero = true};
  }

  ToolTask Task() const override {
    return {ToolKind::ResourceCompiler, m_builder.project.name, m_file.file.path, m_output, {m_file.SourcePath()}};
  }

  void Finish(const CommandResult& result) override {
    m_hasSucceeded = result.succeeded;
    if (m_hasSucceeded) m_outputs->Keep();
    m_outputs.reset();
    if (!m_hasSucceeded) ++m_builder.errorCount;
  }

 private:
  ProjectBuilder& m_builder;
  const ScannedFile& m_file;
  const std::string m_output;
  std::optional<ToolOutputs> m_outputs;
  bool m_hasBegun = false;
};

}  // namespace

std::unique_ptr<BuildStep> ObjectStep(ProjectBuilder& builder, const ScannedFile& scanned) {
  std::string hint;
  if (scanned.file.kind == FileKind::Asm && IsGccFamily(builder.settings.compiler) &&
      IsFirstOfItsKind(builder, scanned)) {
    hint = "an .asm is given to " + AssemblerOf(builder.config) + "; this compiler has no assembler of its own for it";
  }
  return std::make_unique<SourceStep>(builder, scanned.file, std::move(hint));
}

std::unique_ptr<BuildStep> ResourceStep(ProjectBuilder& builder, const ScannedFile& scanned) {
  return std::make_unique<ResourceObjectStep>(builder, scanned);
}

}  // namespace qrex
