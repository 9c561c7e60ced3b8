// Why something is stale, for those who look at a build (builder/build_observer.h). Each is asked behind the judgement
// that it is, and ahead of making it.
#pragma once

#include <string>

#include "builder/build_files.h"
#include "builder/build_observer.h"

namespace qrex {

MakeReason WhyTranslated(BuildFiles& builder, ScannedFile& file);
MakeReason WhyCompiled(BuildFiles& builder, ScannedFile& file, int64_t objectTime);  // 0: there is none

}  // namespace qrex
