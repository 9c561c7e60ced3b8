#include "builder/staleness.h"

#include <algorithm>

#include "platform/system.h"

namespace qrex {

namespace {

// As deep as the imports are.
void RequireStack(const ScannedFile& file) {
  if (platform::IsStackShort()) throw LexScannerException("Imports nested too deeply at " + file.file.path, nullptr);
}

}  // namespace

// The cache is set ahead of the imports, so that a cycle in a dependency file ends here.
int64_t LatestSourceTime(BuildFiles& builder, ScannedFile& file) {
  if (file.latestSourceTime != 0) return file.latestSourceTime;
  RequireStack(file);
  file.latestSourceTime = file.sourceTime != 0 ? file.sourceTime : builder.times.LastWriteTime(file.SourcePath());
  if (file.latestSourceTime == 0) return 0;
  for (ScannedFile* import : file.imports) {
    const int64_t time = LatestSourceTime(builder, *import);
    if (time == 0) return file.latestSourceTime = 0;
    file.latestSourceTime = std::max(file.latestSourceTime, time);
  }
  return file.latestSourceTime;
}

namespace {

int64_t TargetTime(BuildFiles& builder, ScannedFile& file) {
  if (file.targetTime == 0) file.targetTime = builder.times.LastWriteTime(builder.paths.Translated(file.file));
  return file.targetTime;
}

}  // namespace

int64_t LatestTargetTime(BuildFiles& builder, ScannedFile& file, const ScannedFile* importer) {
  if (file.latestTargetTime != 0) return file.latestTargetTime;
  RequireStack(file);
  file.latestTargetTime = TargetTime(builder, file);
  if (file.latestTargetTime == 0) {
    throw LexScannerException("Error - file not translated by qrex : " + file.file.path, nullptr)
        .WithHint(importer ? importer->UseHint(file) : std::string());
  }
  for (ScannedFile* import : file.imports) {
    file.latestTargetTime = std::max(file.latestTargetTime, LatestTargetTime(builder, *import, &file));
  }
  return file.latestTargetTime;
}

bool LiesAhead(const BuildFiles& builder, int64_t time) {
  return time > builder.settings.begun && time > platform::SystemFileTime();
}

bool NeedsTranslation(BuildFiles& builder, ScannedFile& file) {
  if (TargetTime(builder, file) == 0) return true;
  const int64_t sourceTime = LatestSourceTime(builder, file);
  return sourceTime == 0 || sourceTime >= file.translationTime || LiesAhead(builder, file.translationTime);
}

void MarkRegistered(ScannedFile& file) {
  for (ScannedFile* import : file.imports) {
    if (import->tailHolder == &file) import->registered = true;
  }
  if (file.registered) return;
  for (ScannedFile* import : file.imports) {
    if (MayHoldTail(file.file, import->file)) import->registered = true;
  }
  file.registered = true;
}

}  // namespace qrex
