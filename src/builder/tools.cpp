// Compilers, assembler, resource compiler. The linker is in link.cpp.

#include "builder/tools.h"

#include "builder/run_command.h"
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

// False when the tool could not be run at all: the trace log says why.
bool RunOnResponseFile(const ProjectBuilder& builder, const std::string& responseFile, const std::string& text,
                       const std::string& command, std::string& output, int& returnCode) {
  CommandOptions options;
  options.echo = builder.settings.diagnostics;
  options.output = &output;
  options.errorsIntoOutput = IsGccFamily(builder.settings.compiler);  // where that family writes its messages
  if (options.echo) TraceWriter() << responseFile << " = " << text << "\n";
  try {
    const CommandFile response(builder.settings.leftovers, responseFile, text);
    if (RunCommand(builder.settings.tools, command + " @\"" + responseFile + "\"", returnCode, options)) return true;
    TraceWriter() << responseFile << ": " << text << "\n";
  } catch (const FileException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
  }
  return false;
}

// Runs a compiler or assembler and lets its output decide. The return code matters only where it says that the tool did
// not come to its own end and, in the gcc family, that it failed without a message of the known forms.
bool MakeObject(ProjectBuilder& builder, const ProjectFile& file, const std::string& responseFile,
                const std::string& text, const std::string& command) {
  const int64_t errorsBefore = builder.errorCount;
  const bool isGcc = IsGccFamily(builder.settings.compiler);
  std::string output;
  int returnCode = 0;
  RemoveLink(ObjectPath(builder, file));
  try {
    ToolOutputs object(builder.settings, {ObjectPath(builder, file)}, {responseFile});
    const bool ran = RunOnResponseFile(builder, responseFile, text, command, output, returnCode);
    if (ran && ScanToolOutput(builder, output) && !IsAbnormalEnd(returnCode) && !(isGcc && returnCode != 0)) {
      return object.Keep();
    }
    // A tool that came to its own end clears away what it could not finish; gcc's driver may have been the one to end.
    if (ran && !isGcc && !IsAbnormalEnd(returnCode)) object.Keep();
  } catch (const FileException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
  }
  if (builder.errorCount == errorsBefore) {
    if (isGcc && returnCode != 0) TraceWriter() << "Return code : " << returnCode << "\n";
    ++builder.errorCount;
  }
  return false;
}

}  // namespace

bool CompileFile(ProjectBuilder& builder, ScannedFile& scanned) {
  const ProjectFile& file = scanned.file;
  const std::string input = builder.project.usesQrex ? builder.TranslatedPath(scanned) : scanned.SourcePath();
  if (builder.settings.diagnostics) TraceWriter() << "Compiling " << file.path << "\n";
  if (!ToolsTake(builder, {input, ObjectPath(builder, file)})) return false;
  return MakeObject(builder, file, builder.IntermediateDirectory() + "/compiler.rsp",
                    CompilerText(builder, file, input),
                    "cmd /c " + std::string(CompilerOf(builder.settings.compiler).compile));
}

namespace {

bool IsFirstOfItsKind(const ProjectBuilder& builder, const ScannedFile& scanned) {
  for (const ScannedFile* file : builder.scanned) {
    if (file->file.kind == scanned.file.kind) return file == &scanned;
  }
  return false;
}

}  // namespace

bool AssembleFile(ProjectBuilder& builder, ScannedFile& scanned) {
  const std::string directory = builder.IntermediateDirectory();
  const std::string input = builder.TranslatedPath(scanned);
  if (builder.settings.diagnostics) TraceWriter() << "Assembling " << scanned.file.path << "\n";
  if (!ToolsTake(builder, {input, ObjectPath(builder, scanned.file)})) return false;
  const std::string assembler = builder.config.platform == "Win64" ? "ml64" : "ml /coff";
  const bool assembled =
      MakeObject(builder, scanned.file, directory + "/masm.rsp", " /Fo\"" + directory + "/\" \"" + input + "\"",
                 "cmd /c " + assembler + " /c /Cx /nologo");
  if (!assembled && IsGccFamily(builder.settings.compiler) && IsFirstOfItsKind(builder, scanned)) {
    TraceWriter() << Hint("an .asm is given to " + assembler + "; this compiler has no assembler of its own for it");
  }
  return assembled;
}

bool CompileResource(ProjectBuilder& builder, ScannedFile& scanned) {
  MemoryTextWriter command;
  command << "rc.exe ";
  WriteResourceSwitches(command, builder.config);
  command << " /fo\"" << ResourceObjectPath(builder, scanned.file) << "\" \"" << scanned.SourcePath() << "\"";
  TraceWriter() << "Compiling resource file " << scanned.file.path << "\n";
  if (!ToolsTake(builder, {scanned.SourcePath(), ResourceObjectPath(builder, scanned.file)})) return false;
  RemoveLink(ResourceObjectPath(builder, scanned.file));
  CommandOptions options;
  options.echo = builder.settings.diagnostics;
  options.failOnNonZero = true;
  int returnCode;
  try {
    ToolOutputs resource(builder.settings, {ResourceObjectPath(builder, scanned.file)}, {});
    if (RunCommand(builder.settings.tools, command.TakeText(), returnCode, options)) return resource.Keep();
  } catch (const FileException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
  }
  ++builder.errorCount;
  return false;
}

}  // namespace qrex
