#include "builder/make_reason.h"

#include <algorithm>
#include <unordered_set>

#include "builder/staleness.h"

namespace qrex {

namespace {

using Cause = MakeReason::Cause;

// From the file down its imports to the one whose own time is the latest of all, of which each on the way knows the
// time.
template <typename OwnTime>
MakeReason Newest(ScannedFile& file, int64_t KnownTimes::*latest, OwnTime ownTime) {
  const int64_t time = file.times.*latest;
  std::unordered_set<const ScannedFile*> passed;
  for (ScannedFile* at = &file; at && passed.insert(at).second;) {
    if (ownTime(*at) == time) return {Cause::Changed, at->SourcePath(), time};
    const auto next = std::find_if(at->imports.begin(), at->imports.end(), [&](const ScannedFile* import) {
      return import->times.*latest == time && !passed.contains(import);
    });
    at = next == at->imports.end() ? nullptr : *next;
  }
  return {Cause::Changed, file.SourcePath(), time};
}

MakeReason MissingSource(BuildFiles& builder, ScannedFile& file) {
  std::vector<ScannedFile*> open{&file};
  std::unordered_set<const ScannedFile*> met{&file};
  while (!open.empty()) {
    ScannedFile& at = *open.back();
    open.pop_back();
    if (builder.times.LastWriteTime(at.SourcePath()) == 0) return {Cause::InputMissing, at.SourcePath()};
    for (ScannedFile* import : at.imports) {
      if (met.insert(import).second) open.push_back(import);
    }
  }
  return {Cause::InputMissing, file.SourcePath()};
}

}  // namespace

MakeReason WhyTranslated(BuildFiles& builder, ScannedFile& file) {
  if (builder.settings.rebuildAll) return {Cause::RebuildAll};
  if (!builder.dependencyFileLoaded) return {Cause::NothingKnown};
  if (file.times.target == 0) return {Cause::Missing};
  if (file.times.translation == 0) return {Cause::NothingKnown};
  const int64_t sourceTime = LatestSourceTime(builder, file);
  if (sourceTime == 0) return MissingSource(builder, file);
  if (sourceTime < file.times.translation) return {Cause::Ahead};
  return Newest(file, &KnownTimes::latestSource, [&](const ScannedFile& at) {
    return at.times.source != 0 ? at.times.source : builder.times.LastWriteTime(at.SourcePath());
  });
}

MakeReason WhyCompiled(BuildFiles& builder, ScannedFile& file, int64_t objectTime) {
  if (objectTime == 0) return {Cause::Missing};
  if (LatestTargetTime(builder, file) < objectTime) return {Cause::Ahead};
  return Newest(file, &KnownTimes::latestTarget, [](const ScannedFile& at) { return at.times.target; });
}

}  // namespace qrex
