#include "text/output_policy.h"

#include "text/files.h"
#include "text/numbers.h"

namespace qrex {

std::string WithCarriageReturns(std::string_view text) {
  std::string out;
  out.reserve(text.size() + text.size() / 16);
  for (size_t lineFeed; (lineFeed = text.find('\n')) != std::string_view::npos; text.remove_prefix(lineFeed + 1)) {
    out.append(text.substr(0, lineFeed)).append("\r\n");
  }
  return out.append(text);
}

int WriteIfChanged(MemoryTextWriter& writer, const std::string& path) {
  const std::string text = writer.TakeText(false);
  std::string old;
  if (LoadText(old, path, true) && old == text) {
    TraceWriter() << "Skipping " << path << "\n";
    return 0;
  }
  TraceWriter() << "Writing " << path << "\n";
  try {
    ReplaceFile(path, WithCarriageReturns(text));
  } catch (const FileException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
    return 0;
  }
  return 1;
}

void ChangeReadOnly(const std::string& path, bool readOnly) {
  if (SetReadOnly(path, readOnly) || !FileExists(path)) return;
  TraceWriter() << "Failure " << (readOnly ? "setting" : "clearing") << " read only status of file " << path << "\n";
}

bool CopyIfNewer(const std::string& from, const std::string& to, bool readOnly) {
  CreateDirectories(to, false);
  if (LastWriteTime(from) <= LastWriteTime(to)) return true;
  ChangeReadOnly(to, false);
  if (!CopyFile(from, to, false)) {
    TraceWriter() << "...Copy file failed\n";
    return false;
  }
  TouchFile(to, false);
  if (readOnly) ChangeReadOnly(to, true);
  return true;
}

void DeleteReporting(const std::string& path) {
  ChangeReadOnly(path, false);
  if (DeleteFile(path)) TraceWriter() << "Deleting " << path << "\n";
}

}  // namespace qrex
