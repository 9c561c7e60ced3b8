// Compilers, assembler, resource compiler. The linker stands in link.cpp.

#include "build/tools.h"

#include "build/run_command.h"
#include "build/tool_output.h"
#include "text/files.h"
#include "text/output_policy.h"
#include "text/paths.h"
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

std::string CompiledPath(const Project& project, const ProjectConfig& config, const ProjectFile& file) {
  return project.usesQrex ? PathJoin(TranslationDirectory(config), file.path) : project.SourcePath(file);
}

std::string_view GccTargetExtension(TargetType type) {
  static constexpr std::string_view kExtensions[] = {"", "a", "", "so", "???"};
  return kExtensions[static_cast<size_t>(type)];
}

std::string GccTargetPath(const Project& project, const ProjectConfig& config) {
  const std::string_view extension = GccTargetExtension(project.targetType);
  std::string path = project.settings->exportLib + "/" + config.platform + "/" + config.name + "/";
  if (IsLibrary(project.targetType)) path += "lib";
  path += project.name;
  if (!extension.empty()) path.append(".").append(extension);
  return path;
}

std::string ObjectPath(const ProjectBuilder& builder, const ProjectFile& file) {
  return builder.IntermediateDirectory() + "/" + file.stem + (IsGccFamily(builder.settings.compiler) ? ".o" : ".obj");
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
      text << " " << option << "\"" << path << "\"";
    }
  };
  if (IsGccFamily(builder.settings.compiler)) {
    text << builder.config.compilerText;
    writeIncludePaths("-I");
    text << " -o \"" << directory << "/" << file.stem << ".o\"";
  } else {
    const std::string_view prefix = builder.settings.compiler == CompilerKind::vc6 ? "build_" : "";
    WriteCompilerSwitches(text, file, builder.config);
    writeIncludePaths("/I ");
    text << " /Fp\"" << directory << "/" << prefix << builder.project.name << ".pch\"";
    text << " /Fo\"" << directory << "/\"";
    text << " /Fd\"" << directory << "/\"";
  }
  text << " \"" << input << "\"";
  return text.TakeText();
}

// Runs a compiler or assembler through a response file, and lets its output decide.
bool RunOnResponseFile(ProjectBuilder& builder, const std::string& responseFile, const std::string& text,
                       const std::string& command) {
  const bool echo = builder.settings.diagnostics;
  if (echo) TraceWriter() << responseFile << " = " << text << "\n";
  try {
    ReplaceFile(responseFile, WithCarriageReturns(text));
  } catch (const FileException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
    ++builder.errorCount;
    return false;
  }
  const bool isGcc = IsGccFamily(builder.settings.compiler);
  std::string output, errors;
  CommandOptions options;
  options.echo = echo;
  options.output = &output;
  int returnCode = 0;
  options.errorsIntoOutput = isGcc;  // where that family writes its messages
  const bool ran = RunCommand(command + " @\"" + responseFile + "\"", returnCode, options);
  DeleteFile(responseFile);
  if (!ran) {
    TraceWriter() << responseFile << ": " << text << "\n";
    return false;
  }
  const int64_t errorsBefore = builder.errorCount;
  bool succeeded = ScanToolOutput(builder, output);
  if (isGcc && returnCode != 0 && builder.errorCount == errorsBefore) {
    TraceWriter() << "Return code : " << returnCode << "\n";
    ++builder.errorCount;
    succeeded = false;
  }
  return succeeded;
}

}  // namespace

bool CompileFile(ProjectBuilder& builder, ScannedFile& scanned) {
  const ProjectFile& file = scanned.file;
  const std::string input = builder.project.usesQrex ? builder.TranslatedPath(scanned) : scanned.SourcePath();
  if (builder.settings.diagnostics) TraceWriter() << "Compiling " << file.path << "\n";
  return RunOnResponseFile(builder, builder.IntermediateDirectory() + "/compiler.rsp",
                           CompilerText(builder, file, input),
                           IsGccFamily(builder.settings.compiler) ? "cmd /c gcc-4 -c" : "cmd /c cl /c");
}

bool AssembleFile(ProjectBuilder& builder, ScannedFile& scanned) {
  const std::string directory = builder.IntermediateDirectory();
  if (builder.settings.diagnostics) TraceWriter() << "Assembling " << scanned.file.path << "\n";
  const std::string assembler = builder.config.platform == "Win64" ? "ml64" : "ml /coff";
  return RunOnResponseFile(builder, directory + "/masm.rsp",
                           " /Fo\"" + directory + "/\" \"" + builder.TranslatedPath(scanned) + "\"",
                           "cmd /c " + assembler + " /c /Cx /nologo");
}

bool CompileResource(ProjectBuilder& builder, ScannedFile& scanned) {
  MemoryTextWriter command;
  command << "rc.exe ";
  WriteResourceSwitches(command, builder.config);
  command << " /fo\"" << ResourceObjectPath(builder, scanned.file) << "\" \"" << scanned.SourcePath() << "\"";
  TraceWriter() << "Compiling resource file " << scanned.file.path << "\n";
  CommandOptions options;
  options.echo = builder.settings.diagnostics;
  options.failOnNonZero = true;
  int returnCode;
  const bool succeeded = RunCommand(command.TakeText(), returnCode, options);
  if (!succeeded) ++builder.errorCount;
  return succeeded;
}

}  // namespace qrex
