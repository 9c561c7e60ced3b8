// What must be translated again. Times are file times; 0 means that the file does not exist.
#pragma once

#include <cstdint>

#include "builder/build_files.h"

namespace qrex {

// The latest write time of the file and all that it imports; 0 if one of them is missing. Kept in the ScannedFile.
int64_t LatestSourceTime(BuildFiles& builder, ScannedFile& file);
// The same over the translated files. Throws "Error - file not translated by qrex : ", whose hint tells the importer.
int64_t LatestTargetTime(BuildFiles& builder, ScannedFile& file, const ScannedFile* importer = nullptr);
// A time that is still to come tells nothing of what is younger: the clock was ahead when the file was made.
bool LiesAhead(const BuildFiles& builder, int64_t time);
// Prints (builder/fingerprints.h) of times and sizes: of the file's source and all that it imports; of their
// translations.
uint64_t SourcePrint(BuildFiles& builder, ScannedFile& file);
uint64_t TargetPrint(BuildFiles& builder, ScannedFile& file);
FileStamp TargetStamp(BuildFiles& builder, ScannedFile& file);
bool NeedsTranslation(BuildFiles& builder, ScannedFile& file);
// Notes that a .cpp which was not translated in this run registers the headers of its project that it imports directly.
void MarkRegistered(ScannedFile& file);

}  // namespace qrex
