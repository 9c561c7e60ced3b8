#include "text/files.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <future>
#include <thread>

#include "platform/console.h"
#include "platform/file_system.h"
#include "platform/system.h"
#include "text/beside_file.h"

namespace qrex {

namespace {

void Check(std::string_view path) {
  if (!platform::IsValidUtf8(path)) throw StringConversionException();
}
const std::string& Checked(const std::string& path) {
  Check(path);
  return path;
}

constexpr size_t kHeaderSize = 16;

void PutLittleEndian(std::string& out, uint64_t value, size_t bytes) {
  for (size_t i = 0; i < bytes; ++i) out += static_cast<char>(value >> (8 * i));
}

uint64_t GetLittleEndian(std::string_view bytes) {
  uint64_t value = 0;
  for (size_t i = bytes.size(); i-- > 0;) value = value << 8 | static_cast<unsigned char>(bytes[i]);
  return value;
}

// CRC-32 of IEEE 802.3, eight bytes at a time: table k takes a byte on past k more. Boost's goes byte by byte, a tenth
// of a run in which nothing is to do.
constexpr size_t kCrcStep = 8;

constexpr std::array<std::array<uint32_t, 256>, kCrcStep> MakeCrcTables() {
  constexpr uint32_t kPolynomial = 0xEDB88320;
  std::array<std::array<uint32_t, 256>, kCrcStep> tables{};
  for (uint32_t byte = 0; byte < 256; ++byte) {
    uint32_t crc = byte;
    for (int bit = 0; bit < 8; ++bit) crc = crc >> 1 ^ (crc & 1 ? kPolynomial : 0);
    tables[0][byte] = crc;
  }
  for (size_t k = 1; k < kCrcStep; ++k) {
    for (size_t byte = 0; byte < 256; ++byte) {
      const uint32_t before = tables[k - 1][byte];
      tables[k][byte] = before >> 8 ^ tables[0][before & 0xFF];
    }
  }
  return tables;
}

}  // namespace

uint32_t Crc32(std::string_view bytes) {
  static constexpr auto kTables = MakeCrcTables();
  uint32_t crc = 0xFFFFFFFF;
  for (; bytes.size() >= kCrcStep; bytes.remove_prefix(kCrcStep)) {
    const auto tableOf = [&](size_t i, uint32_t mixed) {
      return kTables[kCrcStep - 1 - i][(mixed ^ static_cast<unsigned char>(bytes[i])) & 0xFF];
    };
    crc = tableOf(0, crc) ^ tableOf(1, crc >> 8) ^ tableOf(2, crc >> 16) ^ tableOf(3, crc >> 24) ^ tableOf(4, 0) ^
          tableOf(5, 0) ^ tableOf(6, 0) ^ tableOf(7, 0);
  }
  for (const char byte : bytes) crc = crc >> 8 ^ kTables[0][(crc ^ static_cast<unsigned char>(byte)) & 0xFF];
  return ~crc;
}

bool FileExists(const std::string& path) { return platform::CanRead(Checked(path)); }

platform::Result DeleteFile(const std::string& path) { return platform::RemoveFile(Checked(path)); }

namespace {

// A file of this process's own.
void RemoveBeside(const std::string& beside) {
  platform::SetReadOnlyAttribute(beside, false);
  platform::RemoveFile(beside);
}

// `finish` gets the file beside as it will be renamed.
template <typename Finish>
void WriteBesideAndRename(const std::string& path, std::string_view content, Finish finish) {
  const BesideFile claim(path);
  const std::string& beside = claim.Path();
  platform::Result result = platform::WriteFile(beside, content);
  if (result) result = finish(beside);
  if (result) result = platform::RenameFile(beside, path);
  if (!result) RemoveBeside(beside);
  Require(result, path);
}

}  // namespace

platform::Result CopyFile(const std::string& from, const std::string& to, bool failIfExists, bool readOnly) {
  std::string content;
  platform::FileInfo info;
  if (failIfExists && platform::Stat(Checked(to), info)) return platform::Result::Failure(platform::kErrorFileExists);
  const int64_t readTime = CurrentStamp();
  if (const platform::Result read = platform::ReadFile(Checked(from), content); !read) return read;
  auto finish = [&](const std::string& beside) {
    if (const platform::Result copied = platform::CopyExecuteBits(from, beside); !copied) return copied;
    // A file system whose clock is behind shows in what was written. One that takes no times keeps its own.
    if (platform::Stat(beside, info)) platform::SetWriteTime(beside, std::min(readTime, info.writeTime));
    if (readOnly) platform::SetReadOnlyAttribute(beside, true);
    return platform::Result();
  };
  try {
    WriteBesideAndRename(Checked(to), content, finish);
  } catch (const FileException& exception) {
    return platform::Result::Failure(exception.errorCode);
  }
  return {};
}

platform::Result CreateEmptyFile(const std::string& path, bool keepExisting) {
  return platform::MakeEmptyFile(Checked(path), keepExisting);
}

void CreateDirectories(const std::string& path, bool includeLast) {
  const size_t lastSlash = Checked(path).rfind('/');
  const std::string deepest = includeLast ? path : path.substr(0, lastSlash == std::string::npos ? 0 : lastSlash);
  platform::FileInfo info;
  if (deepest.empty() || platform::Stat(deepest, info)) return;
  // Mostly just the last one is missing: from there back to one that can be made, then forth.
  size_t end = deepest.size();
  while (!platform::MakeDirectory(deepest.substr(0, end))) {
    const size_t slash = deepest.rfind('/', end - 1);
    if (slash == std::string::npos || slash == 0) break;
    end = slash;
  }
  while (end < deepest.size()) {
    end = std::min(deepest.find('/', end + 1), deepest.size());
    platform::MakeDirectory(deepest.substr(0, end));
  }
}

platform::Result SetReadOnly(const std::string& path, bool readOnly) {
  return platform::SetReadOnlyAttribute(Checked(path), readOnly);
}

FileStamp StampOf(const std::string& path) {
  platform::FileInfo info;
  return platform::Stat(Checked(path), info) && info.isPlain ? FileStamp{info.writeTime, info.size} : FileStamp();
}

int64_t LastWriteTime(const std::string& path) { return StampOf(path).time; }

FileTimes::FileTimes() = default;
FileTimes::~FileTimes() = default;

FileStamp FileTimes::StampOf(const std::string& path) {
  const size_t slash = path.rfind('/');
  const size_t nameBegin = slash == std::string::npos ? 0 : slash + 1;
  if (!m_last || std::string_view(path).substr(0, nameBegin) != m_last->first) {
    m_last = nullptr;
    if (m_directories.size() > kMostDirectories) m_directories.clear();
    m_last = &*m_directories.try_emplace(path.substr(0, nameBegin)).first;
  }
  auto& directory = m_last->second;
  if (!directory) directory = std::make_unique<platform::DirectoryTimes>(Checked(path).substr(0, nameBegin));
  if (!directory->IsOpen()) {
    directory.reset();  // it may be made later
    return qrex::StampOf(path);
  }
  Check(std::string_view(path).substr(nameBegin));
  return directory->StampOf(path.c_str() + nameBegin);
}

std::vector<FileStamp> StampsOf(const std::vector<std::string>& paths) {
  constexpr size_t kFewestOfThread = 100;
  std::vector<FileStamp> found(paths.size());
  auto read = [&](size_t begin, size_t end) {
    FileTimes times;
    for (size_t i = begin; i < end; ++i) found[i] = times.StampOf(paths[i]);
  };
  static const size_t kMostThreads = std::max(1u, std::thread::hardware_concurrency());
  const size_t threads = std::clamp<size_t>(paths.size() / kFewestOfThread, 1, kMostThreads);
  std::vector<std::future<void>> others;
  for (size_t i = 1; i < threads; ++i) {
    others.push_back(std::async(read, paths.size() * i / threads, paths.size() * (i + 1) / threads));
  }
  read(0, paths.size() / threads);
  for (std::future<void>& other : others) other.get();
  return found;
}

platform::Result TouchFile(const std::string& path, bool create) {
  platform::FileInfo info;
  const platform::Result known = platform::Stat(Checked(path), info);
  if (!known) return create ? platform::MakeEmptyFile(path, true) : known;
  if (info.isReadOnly) return platform::Result::Failure(platform::kErrorAccessDenied);
  return platform::StampNow(path);
}

int64_t CurrentStamp() { return platform::CurrentStamp(); }

int64_t OnScaleOf(int64_t stamp, int64_t time) {
  constexpr int64_t kSecond = 10'000'000;
  return stamp % kSecond == 0 ? time - time % (2 * kSecond) : time;
}

platform::Result FullPathOf(const std::string& path, std::string& out) {
  return platform::FullPath(Checked(path), out);
}
platform::Result RealPathOf(const std::string& path, std::string& out) {
  return platform::RealPath(Checked(path), out);
}
platform::Result ReadWholeFile(std::string& out, const std::string& path) {
  return platform::ReadFile(Checked(path), out);
}

void FoldLineEnds(std::string& text) {
  const char* const end = text.data() + text.size();
  auto findReturn = [end](const char* from) {
    const void* found = std::memchr(from, '\r', static_cast<size_t>(end - from));
    return found ? static_cast<const char*>(found) : end;
  };
  const char* from = findReturn(text.data());
  char* to = text.data() + (from - text.data());
  while (from < end) {
    *to++ = '\n';
    from += from + 1 < end && from[1] == '\n' ? 2 : 1;
    const char* const next = findReturn(from);
    const size_t length = static_cast<size_t>(next - from);
    std::memmove(to, from, length);
    to += length;
    from = next;
  }
  text.resize(static_cast<size_t>(to - text.data()));
}

bool LoadText(std::string& out, const std::string& path, bool foldLineEnds) {
  std::string text;
  if (!ReadWholeFile(text, path)) return false;
  if (foldLineEnds) FoldLineEnds(text);
  out = std::move(text);
  return true;
}

bool LoadStream(std::string& out, const std::string& path) {
  std::string text;
  if (!platform::ReadFile(Checked(path), text, platform::Readable::AnyFile)) return false;
  FoldLineEnds(text);
  out = std::move(text);
  return true;
}

void LeftoverSweep::Beside(const std::string& path) {
  ++m_writeCount;
  const auto [folder, isNew] = m_swept.insert(path.substr(0, path.rfind('/') + 1));
  if (!isNew) return;
  for (const std::string& name : platform::PlainFileNames(*folder)) {
    if (BesideFile::IsNameOfOne(name)) platform::FileClaim::RemoveAbandoned(*folder + name);
  }
}

void ReplaceFile(const std::string& path, std::string_view content, ReadOnlyTarget readOnly) {
  Checked(path);
  if (readOnly == ReadOnlyTarget::Refuse && platform::IsReadOnlyFile(path) && !platform::IsLink(path)) {
    throw FileException(platform::kErrorAccessDenied, path);
  }
  WriteBesideAndRename(path, content, [](const std::string&) { return platform::Result(); });
}

void ReplaceOwnFile(const std::string& path, std::string_view content) {
  if (!platform::WriteFile(Checked(path), content, platform::Existing::Refused)) {
    ReplaceFile(path, content, ReadOnlyTarget::Replace);
  }
}

bool ReadCheckedFile(uint32_t magic, std::string& payload, const std::string& path) {
  std::string bytes;
  if (!ReadWholeFile(bytes, path) || bytes.size() < kHeaderSize) return false;
  const std::string_view header(bytes.data(), kHeaderSize);
  if (GetLittleEndian(header.substr(0, 4)) != magic) return false;
  const int64_t size = static_cast<int64_t>(GetLittleEndian(header.substr(8, 8)));
  if (size < 0 || static_cast<uint64_t>(size) > bytes.size() - kHeaderSize) return false;
  const std::string_view content(bytes.data() + kHeaderSize, static_cast<size_t>(size));
  if (GetLittleEndian(header.substr(4, 4)) != Crc32(content)) return false;
  payload.assign(content);
  return true;
}

void WriteCheckedFile(uint32_t magic, std::string_view payload, const std::string& path) {
  std::string bytes;
  bytes.reserve(kHeaderSize + payload.size());
  PutLittleEndian(bytes, magic, 4);
  PutLittleEndian(bytes, Crc32(payload), 4);
  PutLittleEndian(bytes, payload.size(), 8);
  bytes += payload;
  std::string old;
  const bool isTheSame = ReadWholeFile(old, path) && old == bytes;
  if (!isTheSame || platform::IsLink(path) || !TouchFile(path, false)) ReplaceFile(path, bytes);
}

// --- File

File::File(const std::string& path, FileMode mode) {
  if (!Open(path, mode)) throw FileException(platform::kErrorFileNotFound, path);
}

File::~File() = default;

platform::Result File::Open(const std::string& path, FileMode mode) {
  static constexpr const char* kModes[] = {"r", "w", "a", "rb", "wb", "ab"};
  Close();
  Checked(path);
  m_bytesWritten = 0;
  m_path = path;
  m_mode = mode;
  const bool forWriting = mode != FileMode::ReadText && mode != FileMode::ReadBinary;
  platform::FileInfo info;
  const bool isRefused = mode == FileMode::Closed || (forWriting && platform::IsReadOnlyFile(path)) ||
                         (platform::Stat(path, info) && !info.isPlain);
  if (isRefused) return platform::Result::Failure(platform::kErrorAccessDenied);
  return m_file.Open(path, kModes[static_cast<int>(mode)]);
}

size_t File::Read(void* buffer, size_t length) { return m_file.Read(buffer, length); }
int64_t File::Length() { return m_bytesWritten; }
int64_t File::Position() { return m_file.Position(); }
bool File::Seek(int64_t position) { return m_file.Seek(position); }

void File::Write(const void* data, size_t length) {
  if (length == 0) return;
  if (!m_file.Write({static_cast<const char*>(data), length})) FailWrite();
  m_bytesWritten += static_cast<int64_t>(length);
}

void File::Flush() {
  if (!m_file.Flush()) FailWrite();
}

void File::Close() {
  if (!m_file.Close() && IsWritable()) FailWrite();
}

void File::FailWrite() const { throw FileException(platform::kErrorWriteFault, m_path); }

bool File::IsWritable() { return m_mode != FileMode::ReadText && m_mode != FileMode::ReadBinary; }

// --- Directories

namespace {

class FileOrDirInfo : public IFileOrDirInfo {
 public:
  bool IsArchive() const override { return false; }
  bool IsCompressed() const override { return false; }
  bool IsDirectory() const override { return info.isDirectory; }
  bool IsEncrypted() const override { return false; }
  bool IsHidden() const override { return info.isHidden; }
  bool IsOffline() const override { return false; }
  bool IsReadOnly() const override { return info.isReadOnly; }
  bool IsSparse() const override { return false; }
  bool IsSystem() const override { return false; }
  int64_t CreationTime() const override { return info.creationTime; }
  int64_t LastAccessTime() const override { return info.accessTime; }
  int64_t LastWriteTime() const override { return info.writeTime; }
  uint32_t SizeLow() const override { return static_cast<uint32_t>(info.size); }
  std::string Name() const override { return info.name; }

  platform::FileInfo info;
};

}  // namespace

struct FileOrDirIterator::State {
  std::string directory;
  std::vector<std::string> names;
  size_t next = 0;
  uint32_t failureCode = 0;
  uint32_t entryFailure = 0;
  FileOrDirInfo info;
};

FileOrDirIterator::FileOrDirIterator(const std::string& pattern) : m_state(std::make_unique<State>()) {
  const size_t slash = Checked(pattern).rfind('/');
  m_state->directory = slash == std::string::npos ? "." : pattern.substr(0, slash);
  m_state->failureCode = platform::EntryNames(slash == 0 ? "/" : m_state->directory, m_state->names).Code();
}

uint32_t FileOrDirIterator::FailureCode() const { return m_state->failureCode; }
uint32_t FileOrDirIterator::EntryFailure() const { return m_state->entryFailure; }

FileOrDirIterator::~FileOrDirIterator() = default;

const IFileOrDirInfo* FileOrDirIterator::Next() {
  while (m_state->next < m_state->names.size()) {
    const std::string& name = m_state->names[m_state->next++];
    m_state->info.info = {};
    m_state->entryFailure = platform::Stat(m_state->directory + "/" + name, m_state->info.info).Code();
    if (m_state->entryFailure == platform::kErrorFileNotFound) continue;  // gone meanwhile, or a link to nothing
    m_state->info.info.name = name;
    return &m_state->info;
  }
  return nullptr;
}

}  // namespace qrex
