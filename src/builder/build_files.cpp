#include "builder/build_files.h"

#include <algorithm>

#include "builder/build_observer.h"
#include "builder/schema_lock.h"
#include "translator/file/translate_file.h"

namespace qrex {

BuildFiles::BuildFiles(ConfigSettings& settings, Project& project, ProjectConfig& config)
    : settings(settings), project(project), config(config), paths(project, config) {}

BuildFiles::~BuildFiles() = default;

ScannedFile& BuildFiles::GetScannedFile(ProjectFile& file) {
  auto& slot = scannedByPath[file.path];
  if (!slot) slot.reset(new (m_memory.allocate(sizeof(ScannedFile), alignof(ScannedFile))) ScannedFile(*this, file));
  return *slot;
}

std::vector<const ScannedFile*> BuildFiles::FilesOfProject() const {
  std::vector<const ScannedFile*> files;
  for (const auto& [path, file] : scannedByPath) {
    if (file->file.project == &project && file->place != 0) files.push_back(file.get());
  }
  std::sort(files.begin(), files.end(), [](const auto* a, const auto* b) { return a->file.path < b->file.path; });
  return files;
}

bool BuildFiles::RegisterGuid(const guid& id, const std::string& owner, std::string& existingOwner) {
  const auto [entry, isNew] = m_guidOwners.emplace(id, owner);
  if (!isNew) existingOwner = entry->second;
  return isNew;
}

const ScannedFile* BuildFiles::FileOfPosition(const char* position) const {
  const auto holds = [position](const ScannedFile& file) {
    return file.HasBegun() && TextRange(std::string_view(file.text.source)).Contains(position);
  };
  if (m_lastPositioned && holds(*m_lastPositioned)) return m_lastPositioned;  // messages come in runs
  for (const auto& [name, file] : scannedByPath) {
    if (holds(*file)) return m_lastPositioned = file.get();
  }
  return nullptr;
}

bool BuildFiles::FindSourcePlace(const char* position, SourcePlace& place) const {
  const ScannedFile* const file = position ? FileOfPosition(position) : nullptr;
  if (!file) return false;
  const TextRange text{std::string_view(file->text.source)};
  const auto lines = m_lineStarts.try_emplace(file, text).first;
  place = {file->SourcePath(), lines->second.LineOf(position), position - text.begin,
           EndOfWord(text, position) - text.begin};
  return true;
}

void BuildFiles::Tell(const Message& message) {
  if (message.severity == Severity::Warning && message.code != 0) ++warningCount;
  settings.Tell(message);
}

Message ErrorOf(const IException& exception) {
  const auto* const parseError = dynamic_cast<const LexScannerException*>(&exception);
  if (!parseError) return Message(Severity::Error, "Error: ", ExceptionText(exception));
  return Message(Severity::Error, "error : ", parseError->message)
      .At({parseError->file, parseError->line, parseError->begin, parseError->end})
      .WithHint(parseError->hint)
      .Apart();
}

// A file that several projects read has its error told by the first of them; each that imports it is named by its own.
void BuildFiles::TellFault(const ScannedFile& file, const IException& exception) {
  if (!settings.faulty.insert(file.SourcePath()).second) return;
  Message message = ErrorOf(exception);
  if (dynamic_cast<const FaultyFileException*>(&exception)) {
    message.severity = Severity::Note;
    message.label = "note : ";
    message.isApart = false;
  } else {
    ++errorCount;
  }
  settings.Tell(message);
}

void BuildFiles::TranslationBegins(const ScannedFile& file) {
  if (settings.observer) settings.observer->TranslationBegins(file);
}

void BuildFiles::TranslationEnds(const ScannedFile& file) {
  if (settings.observer) settings.observer->TranslationEnds(file);
}

std::string BuildFiles::SchemaFault(const ClassDef& def) { return settings.schemas->Fault(def); }

void BuildFiles::DefinesTarget(const ScannedFile& file, int64_t release, const char* position) {
  if (file.file.project != &project) return;
  target = {release, file.file.path, {}};
  FindSourcePlace(position, target.place);
}

void BuildFiles::TakenBack(ScannedFile& file) {
  m_lineStarts.erase(&file);
  if (m_lastPositioned == &file) m_lastPositioned = nullptr;
  registerMap.TakeBack(file.file.path);
  unregisterMap.TakeBack(file.file.path);
}

}  // namespace qrex
