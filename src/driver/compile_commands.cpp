#include "driver/compile_commands.h"

#include "builder/source_command.h"
#include "report/json_writer.h"
#include "text/exceptions.h"
#include "text/files.h"
#include "text/trace.h"

namespace qrex {

namespace {

constexpr char kFileName[] = "compile_commands.json";

void WriteEntry(JsonWriter& json, const std::string& directory, const SourceCommand& command, CompilerKind compiler) {
  json.Line().Open('{').Member("directory", directory).Member("file", command.input).Key("arguments").Open('[');
  for (const std::string& word : command.Words(compiler, "")) json.Value(word);
  json.Close(']').Member("output", command.object).Close('}');
}

}  // namespace

std::string CompileCommandsOf(const Workspace& workspace, const std::string& directory) {
  const ConfigSettings& settings = workspace.settings;
  JsonWriter json;
  json.Open('[');
  for (const auto& project : workspace.projects) {
    const ProjectConfig* const config = project->FindConfig(settings.config, settings.platform);
    if (!config || project->exported || project->hasFaultyFile) continue;
    project->CollectFiles();
    for (const ProjectFile* file : project->files) {
      if (file->kind != FileKind::C && file->kind != FileKind::Cpp) continue;
      SourceCommand command = SourceCommandOf(*project, *config, *file);
      command.launcher.clear();
      WriteEntry(json, directory, command, settings.compiler);
    }
  }
  return json.Close(']').Text() + "\n";
}

bool WriteCompileCommands(const Workspace& workspace) {
  const ConfigSettings& settings = workspace.settings;
  const bool isMade =
      settings.mode == RunMode::Build || settings.mode == RunMode::Gen || settings.mode == RunMode::Compile;
  if (!settings.compileCommands || !isMade) return true;
  if (settings.Environment()) ApplyEnvironment(*settings.Environment());  // names of compilers are looked up there
  std::string directory, present;
  FullPathOf(".", directory);
  const std::string text = CompileCommandsOf(workspace, directory);
  if (ReadWholeFile(present, kFileName) && present == text) return true;
  try {
    settings.leftovers.Beside(kFileName);
    ReplaceFile(kFileName, text);
  } catch (const IException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
    return false;
  }
  return true;
}

}  // namespace qrex
