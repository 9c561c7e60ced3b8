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
  if (file.times.latestSource != 0) return file.times.latestSource;
  RequireStack(file);
  file.times.latestSource = file.times.source != 0 ? file.times.source : builder.times.LastWriteTime(file.SourcePath());
  if (file.times.latestSource == 0) return 0;
  for (ScannedFile* import : file.imports) {
    const int64_t time = LatestSourceTime(builder, *import);
    if (time == 0) return file.times.latestSource = 0;
    file.times.latestSource = std::max(file.times.latestSource, time);
  }
  return file.times.latestSource;
}

namespace {

int64_t TargetTime(BuildFiles& builder, ScannedFile& file) {
  if (file.times.target == 0) file.times.target = builder.times.LastWriteTime(builder.paths.Translated(file.file));
  return file.times.target;
}

}  // namespace

int64_t LatestTargetTime(BuildFiles& builder, ScannedFile& file, const ScannedFile* importer) {
  if (file.times.latestTarget != 0) return file.times.latestTarget;
  RequireStack(file);
  file.times.latestTarget = TargetTime(builder, file);
  if (file.times.latestTarget == 0) {
    throw LexScannerException("Error - file not translated by qrex : " + file.file.path, nullptr)
        .WithHint(importer ? importer->UseHint(file) : std::string());
  }
  for (ScannedFile* import : file.imports) {
    file.times.latestTarget = std::max(file.times.latestTarget, LatestTargetTime(builder, *import, &file));
  }
  return file.times.latestTarget;
}

bool LiesAhead(const BuildFiles& builder, int64_t time) {
  return time > builder.settings.begun && time > platform::SystemFileTime();
}

bool NeedsTranslation(BuildFiles& builder, ScannedFile& file) {
  if (TargetTime(builder, file) == 0) return true;
  const int64_t sourceTime = LatestSourceTime(builder, file);
  return sourceTime == 0 || sourceTime >= file.times.translation || LiesAhead(builder, file.times.translation);
}

void MarkRegistered(ScannedFile& file) {
  for (ScannedFile* import : file.imports) {
    if (import->tail.holder == &file) import->tail.isRegistered = true;
  }
  if (file.tail.isRegistered) return;
  for (ScannedFile* import : file.imports) {
    if (MayHoldTail(file.file, import->file)) import->tail.isRegistered = true;
  }
  file.tail.isRegistered = true;
}

}  // namespace qrex
