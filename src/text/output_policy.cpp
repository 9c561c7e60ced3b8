#include "text/output_policy.h"

#include <algorithm>

#include "platform/file_system.h"
#include "text/files.h"

namespace qrex {

std::string WithCarriageReturns(std::string_view text) {
  std::string out;
  out.reserve(text.size() + static_cast<size_t>(std::count(text.begin(), text.end(), '\n')));
  for (size_t lineFeed; (lineFeed = text.find('\n')) != std::string_view::npos; text.remove_prefix(lineFeed + 1)) {
    out.append(text.substr(0, lineFeed)).append("\r\n", 2);
  }
  out.append(text);
  return out;
}

GeneratedFile::~GeneratedFile() {
  if (m_spilled) platform::RemoveFile(m_spilled->Path());
}

namespace {

constexpr size_t kMostInMemory = 256 << 10;
constexpr size_t kLongestPart = 64 << 10;  // of a line that is copied at once

}  // namespace

char* GeneratedFile::MakeRoom(size_t length) {
  if (m_buffer.size() - m_used < length) {
    if (m_used + length > kMostInMemory) Spill();
    const size_t doubled = std::min(std::max<size_t>(2 * m_buffer.size(), 4 << 10), kMostInMemory);
    m_buffer.resize(std::max(m_used + length, doubled), boost::container::default_init);
  }
  return m_buffer.data() + m_used;
}

// The one copy of the text on its way from the writer's array.
void GeneratedFile::WriteIndented(std::string_view text, size_t blanks, bool atLineStart) {
  while (!text.empty()) {
    const std::string_view part = text.substr(0, kLongestPart);
    const size_t length = std::min(part.find('\n'), part.size());
    const bool endsLine = length < part.size();
    char* to = MakeRoom(blanks + length + 2);
    if (atLineStart) to = std::fill_n(to, blanks, ' ');
    to = std::copy_n(part.data(), length, to);
    if (endsLine) {
      *to++ = '\r';
      *to++ = '\n';
    }
    m_used = static_cast<size_t>(to - m_buffer.data());
    text.remove_prefix(endsLine ? length + 1 : length);
    atLineStart = endsLine;
  }
}

template <typename Step>
void GeneratedFile::Try(Step step) {
  if (m_failure) return;
  try {
    step();
  } catch (const FileException& exception) {
    m_failure = exception.errorCode;
  }
}

void GeneratedFile::RaiseFailure() const {
  if (m_failure) throw FileException(*m_failure, m_path);
}

void GeneratedFile::Spill() {
  Try([this] {
    if (!m_spilled) {
      CreateDirectories(m_path, false);
      m_leftovers.Beside(m_path);
      m_spilled.emplace(m_path);
      Require(m_beside.Open(m_spilled->Path(), FileMode::WriteBinary), m_path);
    }
    m_beside.Write(m_buffer.data(), m_used);
  });
  m_used = 0;
}

std::string GeneratedFile::Text() {
  if (!m_spilled && !m_failure) return std::string(InMemory());
  Spill();
  std::string text;
  Try([&] {
    m_beside.Flush();
    Require(ReadWholeFile(text, m_spilled->Path()), m_path);
  });
  RaiseFailure();
  return text;
}

void GeneratedFile::Commit() {
  if (!m_spilled && !m_failure) {
    m_leftovers.Beside(m_path);
    return ReplaceFile(m_path, InMemory(), ReadOnlyTarget::Replace);
  }
  Spill();
  Try([this] { m_beside.Close(); });
  RaiseFailure();
  Require(platform::RenameFile(m_spilled->Path(), m_path), m_path);
  m_spilled.reset();
}

namespace {

// Whether the bytes are this text, each line feed of which may be CR LF or CR.
bool HoldText(std::string_view bytes, std::string_view text) {
  if (text.find('\r') != text.npos) return false;
  while (!text.empty()) {
    const size_t length = std::min(text.find('\n'), text.size());
    if (bytes.substr(0, length) != text.substr(0, length)) return false;
    bytes.remove_prefix(length);
    text.remove_prefix(length);
    if (text.empty()) break;
    if (bytes.empty() || (bytes.front() != '\r' && bytes.front() != '\n')) return false;
    bytes.remove_prefix(bytes.starts_with("\r\n") ? 2 : 1);
    text.remove_prefix(1);
  }
  return bytes.empty();
}

}  // namespace

FileUpdate UpdateFile(LeftoverSweep& leftovers, MemoryTextWriter& writer, const std::string& path,
                      ReadOnlyTarget readOnly) {
  const std::string text = writer.TakeText(false);
  std::string old;
  if (ReadWholeFile(old, path) && HoldText(old, text)) {
    TraceWriter() << "Skipping " << path << "\n";
    return FileUpdate::Skipped;
  }
  TraceWriter() << "Writing " << path << "\n";
  leftovers.Beside(path);
  try {
    ReplaceFile(path, WithCarriageReturns(text), readOnly);
  } catch (const FileException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
    return FileUpdate::Failed;
  }
  return FileUpdate::Written;
}

int WriteIfChanged(LeftoverSweep& leftovers, MemoryTextWriter& writer, const std::string& path) {
  return UpdateFile(leftovers, writer, path) == FileUpdate::Written ? 1 : 0;
}

void ChangeReadOnly(const std::string& path, bool readOnly) {
  if (const platform::Result set = SetReadOnly(path, readOnly); set || set.IsNotFound() || !FileExists(path)) return;
  TraceWriter() << "Failure " << (readOnly ? "setting" : "clearing") << " read only status of file " << path << "\n";
}

namespace {

// Whether two stamps are too near to each other to tell which file was written last: within a tick of the clock of
// stamps, or where the file system of the source has a coarser scale, in a step of that.
bool AreWithinTick(int64_t source, int64_t target) {
  constexpr int64_t kSlowestTick = 200'000;  // 20 ms
  return source <= target + kSlowestTick && source >= OnScaleOf(source, target) - kSlowestTick;
}

bool HoldTheSame(const std::string& path, const std::string& other) {
  std::string content, otherContent;
  return ReadWholeFile(content, path) && ReadWholeFile(otherContent, other) && content == otherContent;
}

}  // namespace

bool CopyIfNewer(LeftoverSweep& leftovers, const std::string& from, const std::string& to, bool readOnly) {
  CreateDirectories(to, false);
  auto fail = [] {
    TraceWriter() << "...Copy file failed\n";
    return false;
  };
  platform::FileInfo source;
  if (const platform::Result known = platform::Stat(from, source); !known) {
    return known.Code() == platform::kErrorFileNotFound || fail();
  }
  platform::FileInfo target;
  const bool exists = platform::Stat(to, target) && target.isPlain;
  if (!source.isPlain) return true;
  if (exists && AreWithinTick(source.writeTime, target.writeTime)) {
    if (source.size == target.size && HoldTheSame(from, to)) return true;
  } else if (source.writeTime <= (exists ? target.writeTime : 0)) {
    return true;
  }
  leftovers.Beside(to);
  ChangeReadOnly(to, false);
  if (!CopyFile(from, to, false, readOnly)) return fail();
  if (readOnly) ChangeReadOnly(to, true);
  return true;
}

platform::Result DeleteThoughReadOnly(const std::string& path) {
  ChangeReadOnly(path, false);
  return DeleteFile(path);
}

bool DeleteReporting(const std::string& path) {
  const platform::Result deleted = DeleteThoughReadOnly(path);
  if (deleted) {
    TraceWriter() << "Deleting " << path << "\n";
    return true;
  }
  platform::FileInfo info;
  if (deleted.IsNotFound() || (platform::Stat(path, info) && info.isDirectory)) return true;  // no file of ours
  TraceWriter() << "Error: Couldn't delete " << path << " : " << SystemErrorText(deleted.Code()) << "\n";
  return false;
}

void RemoveLink(const std::string& path) {
  if (platform::IsLink(path)) Require(platform::RemoveFile(path), path);
}

}  // namespace qrex
