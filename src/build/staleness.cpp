#include "build/staleness.h"

#include <algorithm>

#include "text/files.h"

namespace qrex {

// The cache is set ahead of the imports, so that a cycle in a dependency file ends here.
int64_t LatestSourceTime(ScannedFile& file) {
  if (file.latestSourceTime != 0) return file.latestSourceTime;
  file.latestSourceTime = LastWriteTime(file.SourcePath());
  if (file.latestSourceTime == 0) return 0;
  for (ScannedFile* import : file.imports) {
    const int64_t time = LatestSourceTime(*import);
    if (time == 0) return file.latestSourceTime = 0;
    file.latestSourceTime = std::max(file.latestSourceTime, time);
  }
  return file.latestSourceTime;
}

int64_t LatestTargetTime(ProjectBuilder& builder, ScannedFile& file) {
  if (file.latestTargetTime != 0) return file.latestTargetTime;
  file.latestTargetTime = LastWriteTime(builder.TranslatedPath(file));
  if (file.latestTargetTime == 0) {
    throw LexScannerException("Error - file not translated by qrex : " + file.file.path, nullptr);
  }
  for (ScannedFile* import : file.imports) {
    file.latestTargetTime = std::max(file.latestTargetTime, LatestTargetTime(builder, *import));
  }
  return file.latestTargetTime;
}

bool NeedsTranslation(const ProjectBuilder& builder, ScannedFile& file) {
  if (LastWriteTime(builder.TranslatedPath(file)) == 0) return true;
  const int64_t sourceTime = LatestSourceTime(file);
  return sourceTime == 0 || sourceTime >= file.translationTime;
}

void MarkRegistered(ScannedFile& file) {
  if (file.registered) return;
  for (ScannedFile* import : file.imports) {
    const ProjectFile& imported = import->file;
    if (imported.project != file.file.project) continue;
    if (!imported.pairedSource || imported.pairedSource == &file.file) import->registered = true;
  }
  file.registered = true;
}

}  // namespace qrex
