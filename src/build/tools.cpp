// Compilers, assembler, resource compiler. The linker stands in link.cpp.

#include "build/tools.h"

#include "build/run_command.h"
#include "build/tool_output.h"
#include "text/files.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "workspace/switch_blocks.h"

namespace qrex {

std::string ObjectPath(const ProjectBuilder& builder, const ProjectFile& file) {
  return builder.IntermediateDirectory() + "/" + file.stem + (IsGccFamily(builder.settings.compiler) ? ".o" : ".obj");
}

std::string ResourceObjectPath(const ProjectBuilder& builder, const ProjectFile& file) {
  return builder.IntermediateDirectory() + "/" + file.stem + ".res";
}

namespace {

void WriteIncludePaths(TextWriter& out, const ProjectBuilder& builder) {
  const std::string_view option = IsVisualCpp(builder.settings.compiler) ? "/I " : "-I";
  auto write = [&](const std::string& path) { out << " " << option << "\"" << path << "\""; };
  const Project& project = builder.project;
  const std::string base = project.usesQrex ? TranslationDirectory(builder.config) : project.rootDir;
  write(PathJoin(base, project.rootToProjDir));
  write(PathJoin(base, project.sourceDir));
  if (project.usesQrex) write(base);
  for (const std::string& root : builder.settings.virtualTree) write(root);
}

std::string CompilerText(const ProjectBuilder& builder, const ProjectFile& file, const std::string& input) {
  const std::string directory = builder.IntermediateDirectory();
  MemoryTextWriter text;
  if (IsGccFamily(builder.settings.compiler)) {
    text << builder.config.compilerText;
    WriteIncludePaths(text, builder);
    text << " -o \"" << directory << "/" << file.stem << ".o\"";
  } else {
    const std::string_view prefix = builder.settings.compiler == CompilerKind::vc6 ? "build_" : "";
    WriteCompilerSwitches(text, file, builder.config);
    WriteIncludePaths(text, builder);
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
