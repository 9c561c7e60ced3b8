// What comes of a translation on the disk: the output of a file, or the copy of one that is not translated.
#pragma once

#include <cstdint>
#include <string>

#include "text/output_policy.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

// The stamp of what is read now, ahead of reading it.
int64_t ReadingTime(const ConfigSettings& settings);

// Replaces the output, unless it is to stay where only blanks and comments differ. What was read at `readTime` is up to
// date from here on.
void WriteOutput(ScannedFile& file, const std::string& target, GeneratedFile& generated, int64_t readTime);
// In place of a translation; tells when it fails.
void WriteCopy(ScannedFile& file, const std::string& target, int64_t readTime);

}  // namespace qrex
