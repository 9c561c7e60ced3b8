#include "builder/build_files.h"

#include <algorithm>

namespace qrex {

BuildFiles::BuildFiles(ConfigSettings& settings, Project& project, ProjectConfig& config)
    : settings(settings), project(project), config(config), paths(project, config) {}

BuildFiles::~BuildFiles() = default;

ScannedFile& BuildFiles::GetScannedFile(ProjectFile& file) {
  std::unique_ptr<ScannedFile>& slot = scannedByPath[file.path];
  if (!slot) slot = std::make_unique<ScannedFile>(*this, file);
  return *slot;
}

std::vector<const ScannedFile*> BuildFiles::FilesOfProject() const {
  std::vector<const ScannedFile*> files;
  for (const auto& [path, file] : scannedByPath) {
    if (file->file.project == &project) files.push_back(file.get());
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
    return file.translated && TextRange(std::string_view(file.sourceText)).Contains(position);
  };
  if (m_lastPositioned && holds(*m_lastPositioned)) return m_lastPositioned;  // messages come in runs
  for (const auto& [name, file] : scannedByPath) {
    if (holds(*file)) return m_lastPositioned = file.get();
  }
  return nullptr;
}

bool BuildFiles::FindSourcePosition(const char* position, std::string& path, int64_t& line) const {
  const ScannedFile* const file = position ? FileOfPosition(position) : nullptr;
  if (!file) return false;
  path = file->SourcePath();
  const auto table = m_lineStarts.try_emplace(file, TextRange(std::string_view(file->sourceText))).first;
  line = table->second.LineOf(position);
  return true;
}

}  // namespace qrex
