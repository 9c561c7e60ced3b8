#include "builder/project_prints.h"

#include <algorithm>
#include <unordered_set>

#include "builder/source_command.h"
#include "builder/staleness.h"
#include "platform/interpreter.h"
#include "platform/system.h"
#include "text/numbers.h"
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
  m_keysBefore = m_known.Keys();
  m_commandBefore = m_known.Command();
  const std::string keys = KeysOf(builder.project);
  std::string command;
  m_keys = PrintMixer().Add(keys).Value();
  if (!settings.translateOnly && !builder.project.exported) {
    command = CommandOf(builder.project, builder.config);
    m_command = PrintMixer().Add(command).Value();
  }
  m_known.SetTexts(keys, command);
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

// --- What differs

bool ProjectPrints::IsOtherSource(ScannedFile& file) const {
  const FileStamp& noted = m_known.Of(file).source;
  return noted.time != 0 && noted != StampOf(file.SourcePath());
}

bool ProjectPrints::IsOtherTranslation(ScannedFile& file) const {
  const FileStamp& noted = m_known.Of(file).translation.stamp;
  return noted.time != 0 && noted != TargetStamp(m_builder, file);
}

// The nearest one, by the path of its source; of other projects nothing is noted here.
std::string ProjectPrints::OtherInput(ScannedFile& file, bool (ProjectPrints::*isOther)(ScannedFile&) const) const {
  std::vector<ScannedFile*> open{&file};
  std::unordered_set<const ScannedFile*> met{&file};
  for (size_t next = 0; next < open.size(); ++next) {
    ScannedFile& at = *open[next];
    if ((this->*isOther)(at)) return at.SourcePath();
    for (ScannedFile* import : at.imports) {
      if (met.insert(import).second) open.push_back(import);
    }
  }
  return {};
}

namespace {

std::vector<std::string> LinesOf(const std::string& text) {
  std::vector<std::string> lines;
  SplitString(text, lines, "\n");
  return lines;
}

// The first line of one text that the other one lacks; empty where it lacks none.
std::string LineBeyond(const std::string& text, const std::string& other) {
  const std::vector<std::string> known = LinesOf(other);
  for (std::string& line : LinesOf(text)) {
    if (std::find(known.begin(), known.end(), line) == known.end()) return std::move(line);
  }
  return {};
}

// "it was made with A, now it is B"; empty for equal texts.
std::string TextDifference(const std::string& before, const std::string& now) {
  const std::string was = LineBeyond(before, now), is = LineBeyond(now, before);
  if (was.empty() && is.empty()) return {};
  return "it was made with " + (was.empty() ? "nothing" : was) + ", now there is " + (is.empty() ? "nothing" : is);
}

}  // namespace

ProjectPrints::Difference ProjectPrints::OfTranslation(ScannedFile& file) const {
  const OutputPrint& known = m_known.Of(file).translation;
  if (known.print == 0) return {{}, "nothing is noted of what it was made from"};
  if (known.stamp != TargetStamp(m_builder, file)) return {{}, "it is not what was written"};
  if (std::string source = OtherInput(file, &ProjectPrints::IsOtherSource); !source.empty()) return {source, {}};
  if (std::string text = TextDifference(m_keysBefore, m_known.Keys()); !text.empty()) return {{}, text};
  return {{}, "a file of another project that it imports is another one"};
}

ProjectPrints::Difference ProjectPrints::OfObject(ScannedFile& file, const FileStamp& stamp) const {
  const OutputPrint& known = m_known.Of(file).object;
  if (known.print == 0) return {{}, "nothing is noted of what it was made from"};
  if (known.stamp != stamp) return {{}, "it is not what was made"};
  if (std::string source = OtherInput(file, &ProjectPrints::IsOtherTranslation); !source.empty()) return {source, {}};
  if (std::string text = TextDifference(m_commandBefore, m_known.Command()); !text.empty()) return {{}, text};
  return {{}, "its command, or a translation of another project that it includes, is another one"};
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
