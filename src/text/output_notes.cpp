#include "text/output_notes.h"

#include <string_view>
#include <utility>

#include "platform/file_system.h"
#include "text/exceptions.h"
#include "text/numbers.h"
#include "text/output_policy.h"
#include "text/text_writer.h"
#include "text/trace.h"

namespace qrex {

namespace {

constexpr std::string_view kMagic = "\xF4\x78\xEF\x2A";
constexpr size_t kMostBytes = 64 << 10;  // then it is written without what is over
constexpr char kBegun = '+', kOver = '-';

void AppendRecord(std::string& text, char mark, const std::string& path) {
  text += mark;
  AppendCompactString(text, path);
}

bool IsThere(const std::string& path) {
  platform::FileInfo info;
  return !platform::Stat(path, info).IsNotFound();
}

// Those that were begun and are not over; false: the file is none of ours.
bool ReadNotes(std::string_view text, std::multiset<std::string>& noted) {
  if (!text.starts_with(kMagic)) return kMagic.starts_with(text);
  text.remove_prefix(kMagic.size());
  while (!text.empty()) {
    const char mark = text.front();
    text.remove_prefix(1);
    if (mark != kBegun && mark != kOver) return false;
    std::string_view path;
    if (!ReadCompactString(text, path)) return true;
    if (mark == kBegun) {
      noted.emplace(path);
    } else if (const auto begun = noted.find(std::string(path)); begun != noted.end()) {
      noted.erase(begun);
    }
  }
  return true;
}

}  // namespace

bool OutputNotes::DeleteNoted() {
  if (!IsThere(m_path)) return true;
  auto fail = [](const std::string& what) {
    TraceWriter() << "Error: " << what << "\n";
    return false;
  };
  std::string text;
  std::multiset<std::string> left;
  if (!ReadWholeFile(text, m_path) || !ReadNotes(text, left)) {
    return fail("Couldn't read " + m_path + ", which names what an earlier run left half-written");
  }
  for (const std::string& noted : left) {
    TraceWriter() << Hint(noted + " is made anew: an earlier run ended while it was written");
    if (!DeleteThoughReadOnly(noted) && IsThere(noted)) {
      return fail("Couldn't delete " + noted + ", which an earlier run left half-written");
    }
  }
  if (DeleteThoughReadOnly(m_path)) return true;
  return fail("Couldn't delete " + m_path);
}

void OutputNotes::Add(LeftoverSweep& leftovers, const std::vector<std::string>& paths) {
  m_noted.insert(paths.begin(), paths.end());
  CreateDirectories(m_path, false);
  leftovers.Beside(m_path);
  try {
    Save(kBegun, paths);
  } catch (const FileException&) {
    for (const std::string& path : paths) m_noted.erase(m_noted.find(path));
    throw;
  }
}

void OutputNotes::Remove(const std::vector<std::string>& paths) {
  for (const std::string& path : paths) m_noted.erase(m_noted.find(path));
  try {
    Save(kOver, paths);
  } catch (const FileException&) {
    // What is noted still will be made once more.
  }
}

std::string OutputNotes::WholeText() const {
  std::string text(kMagic);
  for (const std::string& path : m_noted) AppendRecord(text, kBegun, path);
  return text;
}

void OutputNotes::Save(char mark, const std::vector<std::string>& paths) {
  const size_t size = std::exchange(m_size, 0);
  if (m_noted.empty()) {
    DeleteFile(m_path);
    return;
  }
  std::string text;
  if (size > 0 && size < kMostBytes) {
    for (const std::string& path : paths) AppendRecord(text, mark, path);
    if (platform::WriteFile(m_path, text, platform::Existing::Continued)) {
      m_size = size + text.size();
      return;
    }
  }
  text = WholeText();
  if (size > 0) {
    ReplaceFile(m_path, text);
  } else {
    ReplaceOwnFile(m_path, text);
  }
  m_size = text.size();
}

}  // namespace qrex
