#include "builder/source_command.h"

#include <algorithm>

#include "builder/tool_names.h"
#include "platform/interpreter.h"
#include "text/paths.h"
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

// Launchers that have what stands in a response file compiled, and do nothing else for it.
constexpr std::string_view kReadNoResponseFiles[] = {"sccache"};

bool ReadsResponseFiles(const std::vector<std::string>& launcher) {
  if (launcher.empty()) return true;
  const std::string_view name = FileNameOf(launcher.front());
  return std::find(std::begin(kReadNoResponseFiles), std::end(kReadNoResponseFiles), name) ==
         std::end(kReadNoResponseFiles);
}

}  // namespace

std::string SourceCommand::Program() const { return tool.substr(0, tool.find(' ')); }

std::string SourceCommand::Line(const std::string& responseFile) const {
  std::string line = "cmd /c ";
  for (const std::string& word : launcher) {
    const bool isPlain = !word.empty() && word.find(' ') == std::string::npos;
    line += isPlain ? word + " " : "\"" + word + "\" ";
  }
  return line + tool + (responseFile.empty() ? text : " @\"" + responseFile + "\"");
}

std::vector<std::string> SourceCommand::Words(CompilerKind compiler, const std::string& responseFile) const {
  std::vector<std::string> words = launcher;
  for (std::string& word : ResponseWords(compiler, tool)) words.push_back(std::move(word));
  words[launcher.size()] = platform::NameHere(words[launcher.size()]);
  if (!responseFile.empty()) {
    words.push_back("@" + responseFile);
  } else {
    for (std::string& word : ResponseWords(compiler, text)) words.push_back(std::move(word));
  }
  return words;
}

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
    const ConfigSettings& settings = *project.settings;
    command.launcher = settings.launcher;
    command.hasFile = settings.commandFiles && ReadsResponseFiles(settings.launcher);
    command.tool = CompilerOf(settings.compiler).compile;
    command.name = "compiler";
    command.input = paths.Compiled(file);
    command.text = CompilerText(project, config, file, paths);
  }
  return command;
}

}  // namespace qrex
