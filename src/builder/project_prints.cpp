#include "builder/project_prints.h"

#include <algorithm>

#include "builder/source_command.h"
#include "builder/staleness.h"
#include "platform/interpreter.h"
#include "platform/system.h"
#include "text/text_writer.h"
#include "workspace/switch_blocks.h"

namespace qrex {

namespace {

std::string KeysOf(const Project& project) {
  return TranslationKeys(*project.settings) + "project=" + project.name + "\nroot=" + project.rootToProjDir +
         "\ntarget=" + std::string(TargetTypeExtension(project.targetType)) + "\n";
}

// The compiler as it is found, and what it is told of every source; what it is told of one alone stands in the name of
// its object, or, where switches are read into options, in its command.
std::string CommandOf(const Project& project, const ProjectConfig& config) {
  const ConfigSettings& settings = *project.settings;
  const std::string tool(CompilerOf(settings.compiler).compile);
  const CommonSwitches common = CommonSwitchesOf(project, config);
  std::string text = tool + common.raw;
  for (const std::string& path : common.includePaths) text.append("\n").append(path);
  if (const PlatformEnvironment* environment = settings.Environment()) {
    text.append("\n").append(environment->INCLUDE).append("\n").append(environment->LIB);
  }
  const std::string program = platform::FindProgram(platform::NameHere(tool.substr(0, tool.find(' '))));
  const FileStamp stamp = program.empty() ? FileStamp() : StampOf(program);
  return text + "\n" + program + " " + std::to_string(stamp.time) + " " + std::to_string(stamp.size) + "\n";
}

}  // namespace

ProjectPrints::ProjectPrints(BuildFiles& builder, const std::string& dependencyFile)
    : m_builder(builder), m_path(FingerprintPath(dependencyFile)) {
  const ConfigSettings& settings = builder.settings;
  if (!settings.rebuildAll) m_known.Load(builder, m_path);
  std::string keys = KeysOf(builder.project), command;
  m_keys = PrintMixer().Add(keys).Value();
  if (!settings.translateOnly && !builder.project.exported) {
    command = CommandOf(builder.project, builder.config);
    m_command = PrintMixer().Add(command).Value();
  }
  m_known.SetTexts(std::move(keys), std::move(command));
}

bool ProjectPrints::Differs(const std::string& output, uint64_t print, const FileStamp& stamp) const {
  return m_known.Of(output) != OutputPrint{print, stamp};
}

uint64_t ProjectPrints::TranslationPrint(ScannedFile& file) const {
  return PrintMixer().Add(m_keys).Add(SourcePrint(m_builder, file)).Value();
}

bool ProjectPrints::DiffersTranslated(ScannedFile& file) const {
  return m_known.Of(file).translation != OutputPrint{TranslationPrint(file), TargetStamp(m_builder, file)};
}

uint64_t ProjectPrints::CommandPrint(const ProjectFile& file) const {
  PrintMixer mixer;
  mixer.Add(m_command);
  const bool isCommon = IsGccFamily(m_builder.settings.compiler) && file.kind != FileKind::Asm;
  if (!isCommon) {
    const SourceCommand command = SourceCommandOf(m_builder.project, m_builder.config, file);
    mixer.Add(command.tool).Add(command.text);
  }
  return mixer.Value();
}

uint64_t ProjectPrints::ObjectPrint(ScannedFile& file) const {
  return PrintMixer().Add(CommandPrint(file.file)).Add(qrex::TargetPrint(m_builder, file)).Value();
}

bool ProjectPrints::DiffersObject(ScannedFile& file, const FileStamp& stamp) const {
  return m_known.Of(file).object != OutputPrint{ObjectPrint(file), stamp};
}

uint64_t ProjectPrints::ResourcePrint(const FileStamp& source) const {
  MemoryTextWriter switches;
  WriteResourceSwitches(switches, m_builder.config);
  return PrintMixer().Add(m_command).Add(switches.TakeText()).Add(source).Value();
}

uint64_t ProjectPrints::TargetPrint(std::string_view command, const std::vector<std::string>& inputs,
                                    const std::function<FileStamp(const std::string&)>& stampOf) const {
  PrintMixer mixer;
  mixer.Add(command);
  for (const std::string& input : inputs) mixer.Add(input).Add(stampOf(input));
  return mixer.Value();
}

// Imports may have come and gone since files were looked at; their times are those of that look, so that what has
// changed behind it is stale in the next run.
void ProjectPrints::Save() {
  const auto isTranslated = [](const ScannedFile* file) { return file->state == TranslationState::Done; };
  if (std::any_of(m_builder.scanned.begin(), m_builder.scanned.end(), isTranslated)) {
    for (const auto& [path, file] : m_builder.scannedByPath) file->times.sourcePrint = 0;
  }
  for (ScannedFile* file : m_builder.scanned) {
    if (!isTranslated(file) || file->needsWriting) continue;
    const OutputPrint translation{TranslationPrint(*file), TargetStamp(m_builder, *file)};
    m_known.Note(*file, {file->times.source, file->times.sourceSize}, translation);
  }
  m_known.Save(m_builder, m_path);
}

}  // namespace qrex
