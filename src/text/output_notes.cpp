#include "text/output_notes.h"

#include "platform/file_system.h"
#include "text/exceptions.h"
#include "text/numbers.h"
#include "text/output_policy.h"
#include "text/text_writer.h"
#include "text/trace.h"

namespace qrex {

namespace {

constexpr uint32_t kMagic = 0x2AEF78F2;

bool IsThere(const std::string& path) {
  platform::FileInfo info;
  return !platform::Stat(path, info).IsNotFound();
}

}  // namespace

bool OutputNotes::DeleteNoted() {
  if (!IsThere(m_path)) return true;
  auto fail = [](const std::string& what) {
    TraceWriter() << "Error: " << what << "\n";
    return false;
  };
  std::string payload;
  if (!ReadCheckedFile(kMagic, payload, m_path)) {
    return fail("Couldn't read " + m_path + ", which names what an earlier run left half-written");
  }
  std::string_view rest = payload, path;
  while (!rest.empty() && ReadCompactString(rest, path)) {
    const std::string noted(path);
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
    Save();
  } catch (const FileException&) {
    for (const std::string& path : paths) m_noted.erase(m_noted.find(path));
    throw;
  }
}

void OutputNotes::Remove(const std::vector<std::string>& paths) {
  for (const std::string& path : paths) m_noted.erase(m_noted.find(path));
  try {
    Save();
  } catch (const FileException&) {
    // What is noted still will be made once more.
  }
}

void OutputNotes::Save() {
  if (m_noted.empty()) {
    DeleteFile(m_path);
    return;
  }
  std::string payload;
  for (const std::string& path : m_noted) AppendCompactString(payload, path);
  WriteCheckedFile(kMagic, payload, m_path);
}

}  // namespace qrex
