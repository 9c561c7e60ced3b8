#include "server/source_world.h"

#include <algorithm>
#include <utility>

#include "driver/config_parser.h"
#include "driver/data_folder.h"
#include "driver/run_workspace.h"
#include "text/files.h"
#include "text/paths.h"
#include "text/trace.h"
#include "translator/file/translate_file.h"

namespace qrex::server {

namespace {

std::string FullPath(const std::string& path) {
  std::string full;
  FullPathOf(path, full);
  return CollapseDots(full);
}

// What @print and the like say goes nowhere: standard output belongs to the protocol.
class HeldTrace {
 public:
  HeldTrace() { HoldTrace(&m_told); }
  ~HeldTrace() { HoldTrace(nullptr); }
  HeldTrace(const HeldTrace&) = delete;
  HeldTrace& operator=(const HeldTrace&) = delete;
  const std::string& Told() const { return m_told; }

 private:
  const QuietConsole m_quiet;
  std::string m_told;
};

std::string SettingsText(const std::vector<std::string>& lines) {
  std::string text;
  for (const std::string& line : lines) text += line + "\n";
  return text;
}

}  // namespace

SourceWorld::~SourceWorld() {
  m_apart.reset();
  m_projects.clear();
}

bool SourceWorld::Load(const std::string& configuration, const std::vector<std::string>& lines,
                       const std::string& program) {
  const HeldTrace held;
  m_settings = std::make_unique<ConfigSettings>();
  m_settings->macroWorld.sources = &m_texts;
  m_settings->macroWorld.messages = this;
  m_settings->keepGoing = true;
  try {
    if (!LoadConfiguration(*m_settings, configuration, SettingsText(lines))) return false;
    std::string problem = ValidateSettings(*m_settings);
    if (problem.empty()) problem = AddRuntimeRoot(*m_settings, program);
    if (!problem.empty()) {
      Take(Message(Severity::Error, "Error: ", problem).At({configuration, 1, 0, 0}));
      return false;
    }
    m_settings->lineDirectives = false;  // positions are mapped by character
    m_settings->positionMaps = false;
    m_settings->keepGoing = true;
    m_workspace = LoadToAsk(*m_settings);
  } catch (const IException& exception) {
    Take(ErrorOf(exception));
  }
  if (!m_workspace) return false;
  for (const auto& [path, file] : m_workspace->fileMap) {
    m_bySource.emplace(SourceFullPathOf(*file), file);
    m_byGenerated.emplace(GeneratedPathOf(*file), file);
  }
  return true;
}

std::string SourceWorld::SourcePathOf(const ProjectFile& file) { return file.project->SourcePath(file); }

std::string SourceWorld::SourceFullPathOf(const ProjectFile& file) { return FullPath(SourcePathOf(file)); }

std::string SourceWorld::GeneratedPathOf(const ProjectFile& file) const {
  const ProjectConfig* const config = file.project->FindConfig(m_settings->config, m_settings->platform);
  if (!config || !IsTranslated(*file.project) || !IsTranslated(file)) return FullPath(SourcePathOf(file));
  return m_mirror + "/" + PathJoin(TranslationDirectory(*config), file.path);
}

ProjectFile* SourceWorld::FindFile(const std::string& path) const {
  const auto found = m_bySource.find(path);
  return found == m_bySource.end() ? nullptr : found->second;
}

ProjectFile* SourceWorld::FindGenerated(const std::string& path) const {
  const auto found = m_byGenerated.find(path);
  return found == m_byGenerated.end() ? nullptr : found->second;
}

// --- Messages

void SourceWorld::Take(const Message& message) {
  if (m_isApart) return;
  Message placed = message;
  if (placed.place.file.empty() && m_underway) placed.place = PlaceOfImport(*m_underway, message.text);
  m_touched.insert(placed.place.file);
  m_messages[placed.place.file].push_back(std::move(placed));
}

// What cannot be used is told without a place: it is at the import that names it.
SourcePlace SourceWorld::PlaceOfImport(ProjectFile& file, const std::string& text) {
  const TextIndex& source = m_translated[&file]->source;
  const ScannedFile& scanned = FilesOf(*file.project)->GetScannedFile(file);
  for (size_t line = 0, start = 0; line < source.LineCount(); start += source.Line(line++).size() + 1) {
    const std::string_view words = source.Line(line);
    const size_t open = words.find('"'), close = words.find('"', open + 1);
    if (words.find("@import") > open || close == std::string_view::npos) continue;
    const ProjectFile* const imported = scanned.ResolveImport(std::string(words.substr(open + 1, close - open - 1)));
    if (!imported || text.find(SourcePathOf(*imported)) == std::string::npos) continue;
    return {SourcePathOf(file), static_cast<int64_t>(line) + 1, static_cast<int64_t>(start + open + 1),
            static_cast<int64_t>(start + close)};
  }
  return {SourcePathOf(file), 1, -1, -1};
}

void SourceWorld::ForgetMessages(const std::string& path) {
  if (m_messages.erase(path) > 0) m_touched.insert(path);
}

const std::vector<Message>& SourceWorld::MessagesOf(const std::string& path) const {
  static const std::vector<Message> kNone;
  const auto found = m_messages.find(path);
  return found == m_messages.end() ? kNone : found->second;
}

std::set<std::string> SourceWorld::TakeTouched() { return std::exchange(m_touched, {}); }

// --- Translations

KeepingFiles* SourceWorld::FilesOf(Project& project) {
  const auto [entry, isNew] = m_projects.try_emplace(&project);
  ProjectConfig* const config = isNew ? project.FindConfig(m_settings->config, m_settings->platform) : nullptr;
  if (config) {
    project.CollectFiles();
    entry->second = std::make_unique<KeepingFiles>(*m_settings, project, *config);
    KeepingFiles& files = *entry->second;
    for (ProjectFile* file : project.files) files.scanned.push_back(&files.GetScannedFile(*file));
  }
  return entry->second.get();
}

void SourceWorld::Changed(ProjectFile& changed) {
  m_apart.reset();  // it knows the text of before
  m_current.erase(&changed);
  ForgetMessages(SourcePathOf(changed));
  for (const auto& entry : m_projects) {
    if (entry.second) TakeBack(*entry.second, changed);
  }
}

void SourceWorld::TakeBack(KeepingFiles& files, const ProjectFile& changed) {
  const auto found = files.scannedByPath.find(changed.path);
  if (found == files.scannedByPath.end()) return;
  for (ScannedFile* file : files.BeginPass({found->second.get()})) {
    m_current.erase(&file->file);
    ForgetMessages(file->SourcePath());
  }
  std::erase_if(m_current, [&](const ProjectFile* file) {  // what failed has been taken back, too
    const auto scanned = files.scannedByPath.find(file->path);
    const bool isGone = scanned != files.scannedByPath.end() && !scanned->second->HasBegun() &&
                        IsTranslatedKind(file->kind) && file->project == &files.project;
    if (isGone) ForgetMessages(SourcePathOf(*file));
    return isGone;
  });
}

ScannedFile* SourceWorld::ScannedOf(ProjectFile& file) {
  KeepingFiles* const files = FilesOf(*file.project);
  if (!files) return nullptr;
  TranslationOf(file);
  return &files->GetScannedFile(file);
}

const Translated& SourceWorld::TranslationOf(ProjectFile& file) {
  std::unique_ptr<Translated>& slot = m_translated[&file];
  if (!slot) slot = std::make_unique<Translated>();
  if (m_current.insert(&file).second) Translate(file, *slot);
  return *slot;
}

void SourceWorld::Translate(ProjectFile& file, Translated& translated) {
  const HeldTrace held;
  std::string source;
  m_texts.Read(source, SourcePathOf(file), SourceTexts::Form::File);
  translated.source = TextIndex(source);
  KeepingFiles* const files = FilesOf(*file.project);
  const bool isCopied = !IsTranslated(*file.project) || !IsTranslated(file) || !IsTranslatedKind(file.kind);
  translated.isFaulty = !isCopied && !files;
  if (translated.isFaulty) {
    const std::string config = m_settings->config + "|" + m_settings->platform;
    return Take(Message(Severity::Warning, "", "project " + file.project->name + " has no configuration " + config)
                    .At({SourcePathOf(file), 1, 0, 0}));
  }
  if (isCopied) {
    translated.generated = translated.madeFrom = translated.source;
    translated.map = CharacterMap::OfCopy(source.size());
    return;
  }
  ScannedFile& scanned = files->GetScannedFile(file);
  ProjectFile* const outer = std::exchange(m_underway, &file);
  try {
    BringUpToDate(scanned);
    const KeptOutput& output = files->OutputOf(scanned);
    translated.generated = TextIndex(output.Text());
    translated.madeFrom = translated.source;
    translated.map = CharacterMap::OfTranslation(scanned, output);
  } catch (const FaultyFileException&) {
    translated.isFaulty = true;
  } catch (const IException& exception) {
    translated.isFaulty = true;
    Take(ErrorOf(exception));
  }
  m_underway = outer;
}

void SourceWorld::Mirror(ProjectFile& file) { WriteMirrored(file, TranslationOf(file).generated.Text()); }

void SourceWorld::MirrorApart(ProjectFile& file) {
  if (m_current.contains(&file)) return Mirror(file);
  Project& project = *file.project;
  ProjectConfig* const config = project.FindConfig(m_settings->config, m_settings->platform);
  if (!config || !IsTranslated(project) || !IsTranslated(file) || !IsTranslatedKind(file.kind)) return;
  const HeldTrace held;
  if (!m_apart || &m_apart->project != &project) {
    m_apart = std::make_unique<KeepingFiles>(*m_settings, project, *config);
    for (ProjectFile* its : project.files) m_apart->scanned.push_back(&m_apart->GetScannedFile(*its));
  }
  const std::unordered_set<std::string> faulty = m_settings->faulty;
  std::string text;
  m_isApart = true;
  try {
    ScannedFile& scanned = m_apart->GetScannedFile(file);
    BringUpToDate(scanned);
    text = m_apart->OutputOf(scanned).Text();
  } catch (const IException&) {  // told when it is looked at
  }
  m_isApart = false;
  m_settings->faulty = faulty;
  if (!text.empty()) WriteMirrored(file, text);
}

void SourceWorld::WriteMirrored(const ProjectFile& file, const std::string& text) const {
  const std::string path = GeneratedPathOf(file);
  if (!path.starts_with(m_mirror + "/")) return;
  std::string present;
  if (ReadWholeFile(present, path) && present == text) return;
  CreateDirectories(path, false);
  ReplaceFile(path, text);
}

std::vector<ProjectFile*> SourceWorld::ImportsOf(ProjectFile& file) {
  std::vector<ProjectFile*> imports;
  KeepingFiles* const files = FilesOf(*file.project);
  if (!files) return imports;
  const ScannedFile& asked = files->GetScannedFile(file);
  for (const auto& [path, scanned] : files->scannedByPath) {
    if (scanned.get() != &asked && asked.importClosure.Has(scanned->index)) imports.push_back(&scanned->file);
  }
  return imports;
}

}  // namespace qrex::server
