#include "translator/file/translation_output.h"

#include <algorithm>
#include <chrono>
#include <thread>

#include "lex/scanner.h"
#include "text/files.h"
#include "text/trace.h"
#include "translator/file/position_map.h"

namespace qrex {

namespace {

void PrepareTarget(const std::string& path) {
  CreateDirectories(path, false);
  ChangeReadOnly(path, false);
}

// With `#line` directives, positions are of the text, too: a file in which only they have moved is written.
bool IsTokenEquivalent(const std::string& old, const std::string& text, const ScannedFile& file) {
  const Dialect dialect = file.frame.dialect;
  const Lines lines = file.HasLineDirectives() ? Lines::Counted : Lines::Ignored;
  try {
    return SameTokens(LexScanner(std::string_view(old), dialect), LexScanner(std::string_view(text), dialect), lines);
  } catch (const LexScannerException&) {
    return false;  // the old file is not C++ that the scanner accepts
  }
}

// The time of a translation is that of the reading, so that what is edited while it runs is stale in the next run. It
// is compared with stamps of sources: a file system whose clock is behind, or moves in seconds, shows in what was
// written.
int64_t TranslationTime(const std::string& target, int64_t readTime, bool isWritten) {
  const int64_t stamp = LastWriteTime(target);
  return OnScaleOf(stamp, isWritten ? std::min(readTime, stamp) : readTime);
}

// False, with a message, when it failed.
bool CopySource(const ScannedFile& file, const std::string& target) {
  ChangeReadOnly(target, false);
  CreateDirectories(target, false);
  file.host.Settings().leftovers.Beside(target);
  const bool readOnly = file.host.Settings().makeTranslatedFilesReadOnly;
  if (const platform::Result copied = CopyFile(file.SourcePath(), target, false, readOnly); !copied) {
    TraceWriter() << "ERROR: Copy file " << file.SourcePath() << " to " << target << " failed\n";
    ReportSystemError(copied.Code());
    TraceWriter() << Hint(file.file.project->ListingHint(file.file));
    return false;
  }
  if (readOnly) ChangeReadOnly(target, true);
  return true;
}

// Its stamp is asked for anew when it counts.
void SetTranslated(ScannedFile& file, int64_t time) {
  file.times.translation = time;
  file.times.latestTarget = file.times.target = 0;
  file.times.targetPrint = 0;
}

}  // namespace

// The clock of stamps first passes the begin of the run: a source that was saved just ahead of it could bear the stamp
// of its translation, and be stale again in the next run.
int64_t ReadingTime(const ConfigSettings& settings) {
  const auto end = std::chrono::steady_clock::now() + std::chrono::milliseconds(50);  // a clock may be set back
  while (CurrentStamp() <= settings.begun && std::chrono::steady_clock::now() < end) {
    std::this_thread::sleep_for(std::chrono::microseconds(200));
  }
  return CurrentStamp();
}

void WriteOutput(ScannedFile& file, const std::string& target, GeneratedFile& generated, int64_t readTime) {
  const ConfigSettings& settings = file.host.Settings();
  std::string old, text;
  const bool isCompared = !settings.writeTokenEquivalent && ReadWholeFile(old, target);
  if (isCompared || settings.positionMaps) text = generated.Text();
  const bool isWritten = !isCompared || !IsTokenEquivalent(old, text, file);
  if (!isWritten) {
    if (settings.diagnostics) TraceWriter() << "Token equivalent: " << target << "\n";
  } else {
    if (settings.diagnostics) TraceWriter() << "Writing: " << target << "\n";
    PrepareTarget(target);
    generated.Commit();
  }
  if (settings.makeTranslatedFilesReadOnly) ChangeReadOnly(target, true);
  if (settings.positionMaps) {
    const PositionMap map = PositionMap::OfTranslation(file, text);
    isWritten ? map.Save(target, text) : map.RealignedTo(old, text, file.frame.dialect).Save(target, old);
  }
  file.needsWriting = false;
  SetTranslated(file, TranslationTime(target, readTime, isWritten));
}

void WriteCopy(ScannedFile& file, const std::string& target, int64_t readTime) {
  file.needsWriting = false;
  const bool isCopied = CopySource(file, target);
  SetTranslated(file, isCopied ? TranslationTime(target, readTime, true) : file.times.translation);
}

}  // namespace qrex
