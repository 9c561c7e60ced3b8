// Taking back what files have declared, so that a build can go on with other texts of them.
#pragma once

#include <vector>

#include "translator/symbols/scanned_file.h"

namespace qrex {

// Takes back these files and all that import them, directly or through others: nothing that stays refers to what goes.
// `all`: the files of the build. Gives what went.
std::vector<ScannedFile*> TakeBack(const std::vector<ScannedFile*>& files, const std::vector<ScannedFile*>& all);

}  // namespace qrex
