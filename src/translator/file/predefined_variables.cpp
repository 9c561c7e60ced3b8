#include "translator/file/predefined_variables.h"

#include "text/numbers.h"
#include "translator/emit/emit.h"
#include "translator/symbols/scanned_file.h"
#include "workspace/workspace.h"

namespace qrex {

namespace {

void Define(ScannedFile& file, std::string_view name, std::string value) {
  file.frame.AddVariable(std::make_unique<LSVar>("@" + std::string(name), std::move(value)));
}

// `@macroNAME` is empty: it exists so that `@if` can tell a defined macro from one that is not.
void DefineMacroMark(ScannedFile& file, const std::string& piece) {
  auto mark = std::make_unique<LSMacroVariable>();
  const std::string name = "@macro" + piece;
  const TextRange text{std::string_view(name)};
  mark->name = text;
  mark->body = TextRange(text.end, text.end);
  mark->OwnText(text);
  file.frame.AddVariable(std::move(mark));
}

std::string WithoutQuotes(std::string piece) {
  if (piece.empty() || piece.front() != '"') return piece;
  piece.erase(0, 1);
  if (!piece.empty() && piece.back() == '"') piece.pop_back();
  return piece;
}

void DefineCompilerMacros(ScannedFile& file) {
  const ProjectConfig& config = file.host.Config();
  std::vector<std::string> pieces;
  if (IsVisualCpp(file.host.Settings().compiler)) {
    auto found = config.compilerOptions.find("PreprocessorDefinitions");
    const std::string definitions = found == config.compilerOptions.end() ? std::string() : found->second;
    SplitString(definitions, pieces, ";");
    Define(file, "macros", definitions);
    for (const std::string& piece : pieces) DefineMacroMark(file, piece);
    return;
  }
  SplitString(config.compilerText, pieces, " ");
  std::string macros;
  std::vector<std::string> definitions;
  for (const std::string& piece : pieces) {
    if (piece.compare(0, 2, "-D") != 0) continue;
    definitions.push_back(piece.substr(2));
    if (definitions.size() > 1) macros += ' ';
    macros += definitions.back();
  }
  Define(file, "macros", macros);
  for (const std::string& definition : definitions) DefineMacroMark(file, WithoutQuotes(definition));
}

}  // namespace

void DefinePredefinedVariables(ScannedFile& file) {
  const ProjectFile& source = file.file;
  const Project& project = *source.project;
  const ConfigSettings& settings = file.host.Settings();
  Define(file, "is_public_header", std::string(BoolText(source.isPublicHeader)));
  Define(file, "is_header", std::string(BoolText(source.kind == FileKind::H)));
  Define(file, "is_cpp", std::string(BoolText(source.kind == FileKind::Cpp)));
  Define(file, "root_to_file_path", source.path);
  Define(file, "file_path", file.SourcePath());
  Define(file, "filename", source.name);
  Define(file, "filename_without_extension", source.stem);
  Define(file, "file_extension", source.extension);
  Define(file, "workspace", project.workspace->name);
  Define(file, "project", project.name);
  Define(file, "root_to_projdir_path", project.rootToProjDir);
  Define(file, "root_path", project.rootDir);
  Define(file, "target_type", std::string(TargetTypeName(project.targetType)));
  Define(file, "platform", settings.platform);
  Define(file, "system_name", settings.systemName);
  Define(file, "system_processor", settings.systemProcessor);
  Define(file, "system_version", settings.systemVersion);
  Define(file, "size_of_pointer", settings.sizeofPointer);
  Define(file, "config", settings.config);
  Define(file, "api", project.name + "_API");
  DefineCompilerMacros(file);
}

}  // namespace qrex
