// Compilers, assembler, resource compiler. The linker stands in link.cpp.

#include "builder/tools.h"

#include <utility>

#include "builder/build_step.h"
#include "builder/tool_names.h"
#include "builder/tool_output.h"
#include "text/files.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "text/trace.h"
#include "workspace/switch_blocks.h"

namespace qrex {

std::vector<std::string> IncludePaths(const Project& project, const ProjectConfig& config, bool translated) {
  const std::string base = translated ? TranslationDirectory(config) : project.rootDir;
  std::vector<std::string> paths = {PathJoin(base, project.rootToProjDir), PathJoin(base, project.sourceDir)};
  if (translated) paths.push_back(base);
  const auto& roots = project.settings->virtualTree;
  paths.insert(paths.end(), roots.begin(), roots.end());
  return paths;
}

std::string CompiledDirectory(const Project& project, const ProjectConfig& config) {
  return project.usesQrex ? TranslationDirectory(config) : project.rootDir;
}

std::string_view GccTargetExtension(TargetType type) {
  static constexpr std::string_view kExtensions[] = {"", "a", "", "so", "???"};
  return kExtensions[static_cast<size_t>(type)];
}

std::string GccTargetName(const Project& project) {
  const std::string_view extension = GccTargetExtension(project.targetType);
  std::string name = (IsLibrary(project.targetType) ? "lib" : "") + project.name;
  if (!extension.empty()) name.append(".").append(extension);
  return name;
}

std::string GccTargetPath(const Project& project, const ProjectConfig& config) {
  return project.settings->exportLib + "/" + config.platform + "/" + config.name + "/" + GccTargetName(project);
}

bool HasObject(const ProjectFile& file) {
  return file.kind == FileKind::C || file.kind == FileKind::Cpp || file.kind == FileKind::Asm;
}

std::string ObjectPath(const ProjectBuilder& builder, const ProjectFile& file) {
  const bool isCompiled = file.kind != FileKind::Asm;  // the one assembler names its objects its own way
  const std::string_view extension = isCompiled && IsGccFamily(builder.settings.compiler) ? ".o" : ".obj";
  std::string path;
  path.reserve(builder.IntermediateDirectory().size() + 1 + file.stem.size() + extension.size());
  path.append(builder.IntermediateDirectory()).append("/").append(file.stem).append(extension);
  return path;
}

std::string ResourceObjectPath(const ProjectBuilder& builder, const ProjectFile& file) {
  return builder.IntermediateDirectory() + "/" + file.stem + ".res";
}

namespace {

std::string CompilerText(const ProjectBuilder& builder, const ProjectFile& file, const std::string& input) {
  const std::string directory = builder.IntermediateDirectory();
  MemoryTextWriter text;
  auto writeIncludePaths = [&](std::string_view option) {
    for (const std::string& path : IncludePaths(builder.project, builder.config, builder.project.usesQrex)) {
      text << " " << option << Quoted(builder.settings, path);
    }
  };
  if (IsGccFamily(builder.settings.compiler)) {
    text << builder.config.compilerText;
    writeIncludePaths("-I");
    text << " -o " << QuotedInput(builder.settings, ObjectPath(builder, file));
  } else {
    const std::string_view prefix = CompilerOf(builder.settings.compiler).precompiledPrefix;
    WriteCompilerSwitches(text, file, builder.config);
    writeIncludePaths("/I ");
    text << " /Fp\"" << directory << "/" << prefix << builder.project.name << ".pch\"";
    text << " /Fo\"" << directory << "/\"";
    text << " /Fd\"" << directory << "/\"";
  }
  text << " " << QuotedInput(builder.settings, input);
  return text.TakeText();
}

// Where a step puts what its tool reads. Steps that may run at once must not share it.
std::string ResponseFile(const ProjectBuilder& builder, std::string_view tool, const std::string& object) {
  if (builder.scheduler.Overlaps()) return object + ".rsp";
  return builder.IntermediateDirectory() + "/" + std::string(tool) + ".rsp";
}

// A compiler or assembler makes an object. Its output decides; the return code matters only where it says that the tool
// did not come to its own end and, in the gcc family, that it failed without a message of the known forms.
class ObjectStep : public BuildStep {
 public:
  struct Call {
    std::string_view verb;  // told with diagnostics
    std::string input, object;
    std::string responseFile, text;
    std::string command;
    std::string hint;  // if it fails
  };
  ObjectStep(ProjectBuilder& builder, const ProjectFile& file, Call call)
      : m_builder(builder), m_file(file), m_call(std::move(call)) {}

  std::optional<Command> Prepare() override {
    if (std::exchange(m_hasBegun, true)) return std::nullopt;
    const ConfigSettings& settings = m_builder.settings;
    if (settings.diagnostics) TraceWriter() << m_call.verb << " " << m_file.path << "\n";
    if (!ToolsTake(m_builder, {m_call.input, m_call.object})) return std::nullopt;
    RemoveLink(m_call.object);
    try {
      m_outputs.emplace(settings, std::vector{m_call.object}, std::vector{m_call.responseFile});
      if (settings.diagnostics) TraceWriter() << m_call.responseFile << " = " << m_call.text << "\n";
      m_response.emplace(settings.leftovers, m_call.responseFile, m_call.text);
    } catch (const FileException& exception) {
      TraceWriter() << "Error: " << exception << "\n";
      m_outputs.reset();
      CountFailure();
      return std::nullopt;
    }
    return Command{.line = m_call.command + " @\"" + m_call.responseFile + "\"",
                   .echo = settings.diagnostics,
                   .capturesOutput = true,
                   .errorsIntoOutput = IsGcc()};  // where that family writes its messages
  }

  void Finish(const CommandResult& result) override {
    m_response.reset();
    if (!result.succeeded) TraceWriter() << m_call.responseFile << ": " << m_call.text << "\n";
    const ToolMessages found = ScanToolOutput(m_builder, result.output);
    m_builder.errorCount += found.errors;
    m_builder.warningCount += found.warnings;
    const bool endedItself = result.succeeded && result.end.IsNormal();
    m_hasSucceeded = endedItself && found.errors == 0 && !(IsGcc() && result.ReturnCode() != 0);
    // A tool that came to its own end clears away what it could not finish; gcc's driver may have been the one to end.
    if (m_hasSucceeded || (endedItself && !IsGcc())) m_outputs->Keep();
    m_outputs.reset();
    if (m_hasSucceeded) return;
    if (found.errors == 0 && IsGcc() && result.ReturnCode() != 0) {
      TraceWriter() << "Return code : " << result.ReturnCode() << "\n";
    }
    CountFailure(found.errors);
  }

 private:
  bool IsGcc() const { return IsGccFamily(m_builder.settings.compiler); }
  void CountFailure(int64_t errors = 0) {
    if (errors == 0) ++m_builder.errorCount;
    if (!m_call.hint.empty()) TraceWriter() << Hint(m_call.hint);
  }

  ProjectBuilder& m_builder;
  const ProjectFile& m_file;
  const Call m_call;
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
      : m_builder(builder), m_file(file), m_output(ResourceObjectPath(builder, file.file)) {}

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

std::unique_ptr<BuildStep> CompileStep(ProjectBuilder& builder, const ScannedFile& scanned) {
  const ProjectFile& file = scanned.file;
  const std::string object = ObjectPath(builder, file);
  const std::string input = builder.project.usesQrex ? builder.TranslatedPath(scanned) : scanned.SourcePath();
  return std::make_unique<ObjectStep>(
      builder, file,
      ObjectStep::Call{.verb = "Compiling",
                       .input = input,
                       .object = object,
                       .responseFile = ResponseFile(builder, "compiler", object),
                       .text = CompilerText(builder, file, input),
                       .command = "cmd /c " + std::string(CompilerOf(builder.settings.compiler).compile),
                       .hint = {}});
}

std::unique_ptr<BuildStep> AssembleStep(ProjectBuilder& builder, const ScannedFile& scanned) {
  const std::string object = ObjectPath(builder, scanned.file), input = builder.TranslatedPath(scanned);
  const std::string assembler = builder.config.platform == "Win64" ? "ml64" : "ml /coff";
  const bool isHinted = IsGccFamily(builder.settings.compiler) && IsFirstOfItsKind(builder, scanned);
  return std::make_unique<ObjectStep>(
      builder, scanned.file,
      ObjectStep::Call{
          .verb = "Assembling",
          .input = input,
          .object = object,
          .responseFile = ResponseFile(builder, "masm", object),
          .text = " /Fo\"" + builder.IntermediateDirectory() + "/\" \"" + input + "\"",
          .command = "cmd /c " + assembler + " /c /Cx /nologo",
          .hint = isHinted ? "an .asm is given to " + assembler + "; this compiler has no assembler of its own for it"
                           : std::string()});
}

std::unique_ptr<BuildStep> ResourceStep(ProjectBuilder& builder, const ScannedFile& scanned) {
  return std::make_unique<ResourceObjectStep>(builder, scanned);
}

}  // namespace qrex
