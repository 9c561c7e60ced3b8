#include "builder/staleness.h"

#include <algorithm>

#include "builder/fingerprints.h"
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

FileStamp TargetStamp(BuildFiles& builder, ScannedFile& file) {
  if (file.times.target == 0) {
    const FileStamp stamp = builder.times.StampOf(builder.paths.Translated(file.file));
    file.times.target = stamp.time;
    file.times.targetSize = stamp.size;
  }
  return {file.times.target, file.times.targetSize};
}

namespace {

int64_t TargetTime(BuildFiles& builder, ScannedFile& file) { return TargetStamp(builder, file).time; }

FileStamp SourceStamp(BuildFiles& builder, ScannedFile& file) {
  if (file.times.source == 0) {
    const FileStamp stamp = builder.times.StampOf(file.SourcePath());
    file.times.source = stamp.time;
    file.times.sourceSize = stamp.size;
  }
  return {file.times.source, file.times.sourceSize};
}

// Of the stamps of the file and all that it imports, kept in `print`. A cycle of imports ends there.
uint64_t PrintOf(BuildFiles& builder, ScannedFile& file, uint64_t KnownTimes::*print,
                 FileStamp (*stamp)(BuildFiles&, ScannedFile&)) {
  if (file.times.*print != 0) return file.times.*print;
  RequireStack(file);
  file.times.*print = 1;
  PrintMixer mixer;
  mixer.Add(stamp(builder, file));
  for (ScannedFile* import : file.imports) mixer.Add(PrintOf(builder, *import, print, stamp));
  return file.times.*print = mixer.Value();
}

}  // namespace

uint64_t SourcePrint(BuildFiles& builder, ScannedFile& file) {
  return PrintOf(builder, file, &KnownTimes::sourcePrint, SourceStamp);
}

uint64_t TargetPrint(BuildFiles& builder, ScannedFile& file) {
  return PrintOf(builder, file, &KnownTimes::targetPrint, TargetStamp);
}

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
