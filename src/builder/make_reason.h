// Whether something is stale, and why, for those who look at a build (builder/build_observer.h) or ask ahead of one.
// The reason is asked behind the judgement that it is, and ahead of making it.
#pragma once

#include <string>
#include <vector>

#include "builder/build_files.h"
#include "builder/build_observer.h"
#include "builder/project_prints.h"

namespace qrex {

// `prints` may be null. The stamp of an object that is not there is 0.
bool MustTranslate(BuildFiles& builder, ScannedFile& file, const ProjectPrints* prints);
MakeReason WhyTranslated(BuildFiles& builder, ScannedFile& file);
bool MustCompile(BuildFiles& builder, ScannedFile& file, const FileStamp& object, const ProjectPrints* prints);
MakeReason WhyCompiled(BuildFiles& builder, ScannedFile& file, int64_t objectTime);

// The shortest way from the file to the source at this path, both included: each imports the next. Empty: none leads
// there.
std::vector<const ScannedFile*> ImportChain(const ScannedFile& file, const std::string& sourcePath);

}  // namespace qrex
