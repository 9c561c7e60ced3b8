#include "builder/project_schemas.h"

#include <algorithm>

#include "text/numbers.h"
#include "text/paths.h"
#include "translator/file/translate_file.h"

namespace qrex {

namespace {

// Translates once more what the build has told of already.
class QuietFiles : public BuildFiles {
 public:
  using BuildFiles::BuildFiles;
  void Tell(const Message&) override {}
  void TranslationBegins(const ScannedFile&) override {}
  void TranslationEnds(const ScannedFile&) override {}
};

bool IsAsked(const ProjectFile& file) {
  return file.kind == FileKind::C || file.kind == FileKind::Cpp || file.kind == FileKind::H;
}

}  // namespace

std::string ProjectSchemas::NotePath(const std::string& dependencyFile) {
  std::string path;
  ReplaceExtension(dependencyFile, "qrexschemas", path);
  return path;
}

ProjectSchemas::ProjectSchemas(BuildFiles& builder, SchemaLock& lock, const std::string& dependencyFile)
    : m_builder(builder),
      m_lock(lock),
      m_path(NotePath(dependencyFile)),
      m_project(SchemaProject(builder.project.rootToProjDir)) {
  if (!ReadWholeFile(m_note, m_path)) return;
  const size_t end = std::min(m_note.find('\n'), m_note.size()), blank = m_note.find(' ');
  if (end == m_note.size()) return;
  m_noteLines = m_note.substr(end + 1);
  std::string error;
  if (blank < end && ParseNumber(m_note.substr(0, blank), m_target.release, error)) {
    m_target.path = m_note.substr(blank + 1, end - blank - 1);
  }
}

bool ProjectSchemas::SeesAll() const {
  return std::all_of(m_builder.scanned.begin(), m_builder.scanned.end(), [](const ScannedFile* file) {
    return !IsAsked(file->file) || file->state == TranslationState::Done;
  });
}

void ProjectSchemas::TranslateAll(BuildFiles& files) const {
  for (ProjectFile* file : m_builder.project.files) {
    if (IsAsked(*file)) BringUpToDate(files.GetScannedFile(*file));
  }
}

void ProjectSchemas::TellGone() const {
  for (const SchemaLock::Gone& gone : m_lock.GoneModels(m_project)) {
    m_builder.settings.Tell(Message(Severity::Warning, "warning : ",
                                    gone.name + " is no model with a $schema of project " + m_builder.project.name +
                                        " any more: its archives can't be read. If none is left, take its lines out")
                                .At({m_lock.Path(), gone.line}));
  }
}

void ProjectSchemas::Check() {
  const bool isKnown = !m_note.empty() && m_noteLines == m_lock.FoundLines(m_project);
  if (m_builder.target.release >= 0) {
    m_target = m_builder.target;
  } else if (const ProjectFile* file = m_builder.FindFile(m_target.path)) {
    const auto scanned = m_builder.scannedByPath.find(file->path);
    const bool isRead = scanned != m_builder.scannedByPath.end() && scanned->second->state == TranslationState::Done;
    if (isRead) m_target = {};  // and defines no target now
  } else {
    m_target = {};
  }
  if (SeesAll()) {
    TellGone();
  } else if (!isKnown) {
    QuietFiles files(m_builder.settings, m_builder.project, m_builder.config);
    TranslateAll(files);
    m_target = files.target;
    TellGone();
  }
  m_agrees = true;  // the next run asks for the target again
  CheckTarget();
}

// The source that defines it may be up to date: where it stands is then found by translating it.
void ProjectSchemas::CheckTarget() {
  const int64_t last = m_lock.LastRelease(m_project);
  if (m_target.release < 0 || m_target.release >= last) return;
  ProjectFile* const file = m_builder.FindFile(m_target.path);
  if (m_target.place.file.empty() && file) {
    QuietFiles files(m_builder.settings, m_builder.project, m_builder.config);
    BringUpToDate(files.GetScannedFile(*file));
    m_target = files.target;
    if (m_target.release < 0 || m_target.release >= last) return;
  }
  LexScannerException exception("The target of the project writes archives of release " +
                                    std::to_string(m_target.release) + ", and a $schema of it has release " +
                                    std::to_string(last) + ": nothing could read them, define the target with " +
                                    std::to_string(last),
                                nullptr);
  exception.SetPlace(m_target.place);
  throw exception;
}

void ProjectSchemas::Save() {
  if (!m_agrees) return;
  const std::string target = m_target.release < 0 ? "-" : std::to_string(m_target.release) + " " + m_target.path;
  const std::string note = target + "\n" + m_lock.Lines(m_project);
  if (note == m_note) return;
  CreateDirectories(m_path, false);
  m_builder.settings.leftovers.Beside(m_path);
  ReplaceFile(m_path, note);
  m_note = note;
}

}  // namespace qrex
