#include "builder/make_reason.h"

#include <algorithm>
#include <unordered_map>
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

bool IsTranslationStale(BuildFiles& builder, ScannedFile& file) {
  return !builder.dependencyFileLoaded || NeedsTranslation(builder, file);
}

bool IsObjectStale(BuildFiles& builder, ScannedFile& file, int64_t objectTime) {
  return LatestTargetTime(builder, file) >= objectTime || LiesAhead(builder, objectTime);
}

}  // namespace

bool MustTranslate(BuildFiles& builder, ScannedFile& file, const ProjectPrints* prints) {
  return IsTranslationStale(builder, file) || (prints && prints->DiffersTranslated(file));
}

bool MustCompile(BuildFiles& builder, ScannedFile& file, const FileStamp& object, const ProjectPrints* prints) {
  return IsObjectStale(builder, file, object.time) || (prints && prints->DiffersObject(file, object));
}

MakeReason WhyTranslated(BuildFiles& builder, ScannedFile& file) {
  if (!IsTranslationStale(builder, file)) return {Cause::Differs};
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
  if (!IsObjectStale(builder, file, objectTime)) return {Cause::Differs};
  if (LatestTargetTime(builder, file) < objectTime) return {Cause::Ahead};
  return Newest(file, &KnownTimes::latestTarget, [](const ScannedFile& at) { return at.times.target; });
}

std::vector<const ScannedFile*> ImportChain(const ScannedFile& file, const std::string& sourcePath) {
  std::unordered_map<const ScannedFile*, const ScannedFile*> importerOf{{&file, nullptr}};
  std::vector<const ScannedFile*> open{&file}, chain;
  for (size_t next = 0; next < open.size(); ++next) {
    const ScannedFile* const at = open[next];
    if (at->SourcePath() == sourcePath) {
      for (const ScannedFile* step = at; step; step = importerOf[step]) chain.insert(chain.begin(), step);
      break;
    }
    for (const ScannedFile* import : at->imports) {
      if (importerOf.try_emplace(import, at).second) open.push_back(import);
    }
  }
  return chain;
}

}  // namespace qrex
