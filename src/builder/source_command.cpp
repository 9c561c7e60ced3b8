#include "builder/source_command.h"

#include "builder/tool_names.h"
#include "text/text_writer.h"
#include "workspace/switch_blocks.h"

namespace qrex {

CommonSwitches CommonSwitchesOf(const Project& project, const ProjectConfig& config) {
  const bool isRaw = IsGccFamily(project.settings->compiler);
  return {isRaw ? config.compilerText : std::string(), IncludePaths(project, config, project.usesQrex)};
}

std::string AssemblerOf(const ProjectConfig& config) { return config.platform == "Win64" ? "ml64" : "ml /coff"; }

namespace {

std::string CompilerText(const Project& project, const ProjectConfig& config, const ProjectFile& file,
                         const BuildPaths& paths) {
  const CompilerKind compiler = project.settings->compiler;
  const CommonSwitches common = CommonSwitchesOf(project, config);
  MemoryTextWriter text;
  auto writeIncludePaths = [&](std::string_view option) {
    for (const std::string& path : common.includePaths) text << " " << option << Quoted(compiler, path);
  };
  if (IsGccFamily(compiler)) {
    text << common.raw;
    writeIncludePaths("-I");
    text << " -o " << QuotedInput(compiler, paths.Object(file));
  } else {
    WriteCompilerSwitches(text, file, config);
    writeIncludePaths("/I ");
    text << " /Fp\"" << paths.Intermediate() << "/" << CompilerOf(compiler).precompiledPrefix << project.name
         << ".pch\"";
    text << " /Fo\"" << paths.Intermediate() << "/\"";
    text << " /Fd\"" << paths.Intermediate() << "/\"";
  }
  text << " " << QuotedInput(compiler, paths.Compiled(file));
  return text.TakeText();
}

}  // namespace

SourceCommand SourceCommandOf(const Project& project, const ProjectConfig& config, const ProjectFile& file) {
  const BuildPaths paths(project, config);
  SourceCommand command;
  command.object = paths.Object(file);
  if (file.kind == FileKind::Asm) {
    command.tool = AssemblerOf(config) + " /c /Cx /nologo";
    command.name = "masm";
    command.input = paths.Translated(file);
    command.text = " /Fo\"" + paths.Intermediate() + "/\" \"" + command.input + "\"";
  } else {
    command.tool = CompilerOf(project.settings->compiler).compile;
    command.name = "compiler";
    command.input = paths.Compiled(file);
    command.text = CompilerText(project, config, file, paths);
  }
  return command;
}

}  // namespace qrex
