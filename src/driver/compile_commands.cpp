#include "driver/compile_commands.h"

#include <string_view>
#include <vector>

#include "builder/source_command.h"
#include "report/json_writer.h"
#include "text/exceptions.h"
#include "text/files.h"
#include "text/trace.h"

namespace qrex {

namespace {

constexpr char kFileName[] = "compile_commands.json";

// Precompiled headers of cl are none that clang could read. The sources include their headers all the same.
bool IsOfPrecompiledHeader(std::string_view word) {
  return word.starts_with("/Yu") || word.starts_with("/Yc") || word.starts_with("/Fp");
}

std::vector<std::string> WordsOf(const SourceCommand& command, CompilerKind compiler) {
  std::vector<std::string> words = command.Words(compiler, "");
  if (!IsVisualCpp(compiler)) return words;
  std::vector<std::string> kept;
  for (std::string& word : words) {
    const bool isPath = word == command.input || (!kept.empty() && kept.back() == "/I");
    if (isPath || !IsOfPrecompiledHeader(word)) kept.push_back(std::move(word));
  }
  return kept;
}

void WriteEntry(JsonWriter& json, const std::string& directory, const SourceCommand& command, CompilerKind compiler) {
  json.Line().Open('{').Member("directory", directory).Member("file", command.input).Key("arguments").Open('[');
  for (const std::string& word : WordsOf(command, compiler)) json.Value(word);
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
