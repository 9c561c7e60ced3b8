// Passes of one builder over its files behind the first.
#include <algorithm>

#include "builder/project_builder.h"
#include "translator/file/take_back.h"

namespace qrex {

namespace {

std::vector<ScannedFile*> AllFiles(const BuildFiles& builder) {
  std::vector<ScannedFile*> files;
  files.reserve(builder.scannedByPath.size());
  for (const auto& [path, file] : builder.scannedByPath) files.push_back(file.get());
  return files;
}

}  // namespace

std::vector<ScannedFile*> BuildFiles::BeginPass(const std::vector<ScannedFile*>& changed) {
  const std::vector<ScannedFile*> all = AllFiles(*this);
  std::vector<ScannedFile*> taken = TakeBack(changed, all);
  m_symbols.BeginPass();
  settings.faulty.clear();
  for (ScannedFile* file : all) {
    if (file->state == TranslationState::Failed) file->TakeBack();
    file->isKept = file->state == TranslationState::Done;
    file->place = 0;
    file->tail.isRegistered = false;
  }
  return taken;
}

void ProjectBuilder::BeginPass(const std::vector<ProjectFile*>& changed) {
  std::vector<ScannedFile*> stale;
  stale.reserve(changed.size());
  for (ProjectFile* file : changed) stale.push_back(&GetScannedFile(*file));
  const auto write = [this](ScannedFile* file) { file->needsWriting = file->file.project == &project; };
  std::for_each(stale.begin(), stale.end(), write);
  const std::vector<ScannedFile*> taken = BuildFiles::BeginPass(stale);
  std::for_each(taken.begin(), taken.end(), write);
  m_hasStaleFiles = true;
}

bool ProjectBuilder::RegistriesMoved() {
  const bool registers = registerMap.IsDirty();
  return unregisterMap.IsDirty() || registers;
}

void ProjectBuilder::WriteAgain(ScannedFile& file, MakeReason::Cause why) {
  if (settings.observer && !file.needsWriting) settings.observer->IsStale(paths.Translated(file.file), {why});
  if (file.isKept) {
    const std::vector<ScannedFile*> files{&file};
    for (ScannedFile* taken : TakeBack(files, AllFiles(*this))) taken->needsWriting = true;
  }
  file.needsWriting = true;
}

void ProjectBuilder::TranslateAgain(const std::vector<ProjectFile*>& changed) {
  BeginPass(changed);
  for (ScannedFile* file : scanned) ProcessFile(*file, nullptr);
  registerMap.dirty = unregisterMap.dirty = false;
  ReportUnregistered();
}

}  // namespace qrex
