#include "platform/file_system.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <boost/filesystem.hpp>
#include <cerrno>
#include <ctime>
#include <filesystem>

#include "platform/streams.h"

namespace qrex::platform {

namespace {

constexpr int64_t kUnixEpoch = 116444736000000000;  // 1970 on the scale of file times
constexpr size_t kLargePage = 2u << 20;
constexpr mode_t kWriteBits = S_IWUSR | S_IWGRP | S_IWOTH;

constexpr int64_t kUnitsOfSecond = 10'000'000;

int64_t FileTime(const timespec& time) { return kUnixEpoch + time.tv_sec * kUnitsOfSecond + time.tv_nsec / 100; }

bool IsLink(const struct stat& status) {
  return S_ISLNK(status.st_mode) || (S_ISREG(status.st_mode) && status.st_nlink > 1);
}

// A descriptor that closes itself.
class Descriptor {
 public:
  Descriptor(const std::string& path, int flags) : m_number(open(path.c_str(), flags | O_CLOEXEC, 0666)) {}
  ~Descriptor() {
    if (m_number >= 0) close(m_number);
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  explicit operator bool() const { return m_number >= 0; }
  int Number() const { return m_number; }
  bool Close() {
    const bool closed = close(m_number) == 0;
    m_number = -1;
    return closed;
  }

 private:
  int m_number;
};

Result Refused() { return Result::Failure(kErrorAccessDenied); }

}  // namespace

void PreferLargePages(void* memory, size_t size) {
  constexpr uintptr_t kPage = 4096;
  if (size < kLargePage) return;
  char* const nextPage = static_cast<char*>(memory) + (kPage - reinterpret_cast<uintptr_t>(memory) % kPage);
  madvise(nextPage, size - kPage, MADV_HUGEPAGE);
}

void ReserveText(std::string& text, size_t size) {
  if (size >= kLargePage) size += kLargePage;  // so that the last of them holds the text's end
  text.reserve(size);
  PreferLargePages(text.data(), size);
}

Result Stat(const std::string& path, FileInfo& info) {
  struct stat status;
  if (stat(path.c_str(), &status) != 0) return Result::OfCall(false);
  info.isDirectory = S_ISDIR(status.st_mode);
  info.isPlain = S_ISREG(status.st_mode);
  info.isReadOnly = (status.st_mode & kWriteBits) == 0;
  info.creationTime = FileTime(status.st_ctim);
  info.accessTime = FileTime(status.st_atim);
  info.writeTime = FileTime(status.st_mtim);
  info.size = static_cast<uint64_t>(status.st_size);
  info.name = path.substr(path.rfind('/') + 1);
  info.isHidden = !info.name.empty() && info.name.front() == '.';
  return {};
}

int64_t CurrentStamp() {
  timespec now;
  clock_gettime(CLOCK_REALTIME_COARSE, &now);
  return FileTime(now);
}

DirectoryTimes::DirectoryTimes(const std::string& directory)
    : m_handle(open(directory.empty() ? "." : directory.c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC)) {}

DirectoryTimes::~DirectoryTimes() {
  if (IsOpen()) close(static_cast<int>(m_handle));
}

FileStamp DirectoryTimes::StampOf(const char* name) const {
  struct stat status;
  const bool isFile = fstatat(static_cast<int>(m_handle), name, &status, 0) == 0 && S_ISREG(status.st_mode);
  return isFile ? FileStamp{FileTime(status.st_mtim), static_cast<uint64_t>(status.st_size)} : FileStamp();
}

bool CanRead(const std::string& path) {
  FileInfo info;
  return Stat(path, info) && info.isPlain && access(path.c_str(), R_OK) == 0;
}

bool IsReadOnlyFile(const std::string& path) {
  FileInfo info;
  return Stat(path, info) && !info.isDirectory && info.isReadOnly;
}

bool IsLink(const std::string& path) {
  struct stat status;
  return lstat(path.c_str(), &status) == 0 && IsLink(status);
}

Result ReadFile(const std::string& path, std::string& content, Readable kind) {
  const bool plainOnly = kind == Readable::PlainFile;
  Descriptor file(path, O_RDONLY | (plainOnly ? O_NONBLOCK : 0));  // the open itself may wait for a pipe's writer
  struct stat status;
  if (!file || fstat(file.Number(), &status) != 0) return Result::OfCall(false);
  if (S_ISDIR(status.st_mode) || (plainOnly && !S_ISREG(status.st_mode))) return Refused();
  // A file of the proc file system has no size, and one that grows has more: read to the end. Less than the size is a
  // fault, not the end.
  const size_t size = static_cast<size_t>(status.st_size);
  content.clear();
  ReserveText(content, size);
  char block[65536];
  for (;;) {
    const ssize_t got = read(file.Number(), block, sizeof block);
    if (got < 0 && errno == EINTR) continue;
    if (got < 0) return Result::OfCall(false);
    content.append(block, static_cast<size_t>(got));
    if (got > 0 && content.size() == size) return {};
    if (got > 0) continue;
    return Result::OfSystem(content.size() < size ? EIO : 0);
  }
}

// To truncate also an empty file would have some file systems write it to the disk when it is closed.
Result WriteFile(const std::string& path, std::string_view content, Existing existing) {
  const int how = existing == Existing::Continued ? O_APPEND : existing == Existing::Refused ? O_EXCL : 0;
  Descriptor file(path, O_WRONLY | O_CREAT | how);
  if (!file) return Result::OfCall(false);
  if (existing == Existing::Replaced) {
    struct stat status;
    if (fstat(file.Number(), &status) != 0) return Result::OfCall(false);
    if (status.st_size > 0 && ftruncate(file.Number(), 0) != 0) return Result::OfCall(false);
  }
  while (!content.empty()) {
    const ssize_t written = write(file.Number(), content.data(), content.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return Result::OfCall(false);
    content.remove_prefix(static_cast<size_t>(written));
  }
  return Result::OfCall(file.Close());
}

Result MakeEmptyFile(const std::string& path, bool keepExisting) {
  if (IsReadOnlyFile(path)) return Refused();
  const Descriptor file(path, O_WRONLY | O_CREAT | (keepExisting ? 0 : O_EXCL));
  return Result::OfCall(static_cast<bool>(file));
}

Result RemoveFile(const std::string& path) {
  if (!IsLink(path) && IsReadOnlyFile(path)) return Refused();
  return Result::OfCall(unlink(path.c_str()) == 0);
}

CStream OpenStream(const std::string& path, const char* mode) { return CStream(std::fopen(path.c_str(), mode)); }
CStream OpenTemporary() { return CStream(std::tmpfile()); }

Result RemoveTree(const std::string& path) {
  boost::system::error_code error;
  boost::filesystem::remove_all(path, error);
  return Result::OfSystem(error.value());
}

Result RenameFile(const std::string& from, const std::string& to) {
  return Result::OfCall(std::rename(from.c_str(), to.c_str()) == 0);
}

Result MakeDirectory(const std::string& path) { return Result::OfCall(mkdir(path.c_str(), 0777) == 0); }

Result SetReadOnlyAttribute(const std::string& path, bool readOnly) {
  struct stat status;
  if (lstat(path.c_str(), &status) != 0) return Result::OfCall(false);
  if (IsLink(status) || ((status.st_mode & kWriteBits) == 0) == readOnly) return {};
  const mode_t mode = readOnly ? status.st_mode & ~kWriteBits : status.st_mode | S_IWUSR;
  return Result::OfCall(chmod(path.c_str(), mode) == 0);
}

Result CopyExecuteBits(const std::string& from, const std::string& to) {
  constexpr mode_t kExecuteBits = S_IXUSR | S_IXGRP | S_IXOTH;
  struct stat source, target;
  if (stat(from.c_str(), &source) != 0 || stat(to.c_str(), &target) != 0) return Result::OfCall(false);
  const mode_t bits = source.st_mode & kExecuteBits;
  return Result::OfCall(bits == 0 || chmod(to.c_str(), (target.st_mode | bits) & 07777) == 0);
}

Result StampNow(const std::string& path) { return Result::OfCall(utimensat(AT_FDCWD, path.c_str(), nullptr, 0) == 0); }

Result SetWriteTime(const std::string& path, int64_t time) {
  const int64_t sinceEpoch = time - kUnixEpoch;
  const timespec stamp{sinceEpoch / kUnitsOfSecond, sinceEpoch % kUnitsOfSecond * 100};
  const timespec times[2] = {stamp, stamp};
  return Result::OfCall(utimensat(AT_FDCWD, path.c_str(), times, 0) == 0);
}

Result FullPath(const std::string& path, std::string& out) {
  boost::system::error_code error;
  const boost::filesystem::path full = boost::filesystem::absolute(path, error);
  if (path.empty() || error) return Result::Failure(kErrorFileNotFound);
  out = full.lexically_normal().generic_string();
  if (out.size() > 2 && out.compare(out.size() - 2, 2, "/.") == 0) out.resize(out.size() - 2);
  if (out.size() > 1 && out.back() == '/') out.pop_back();
  return {};
}

std::string CollapseDots(std::string_view path) {
  return std::filesystem::path(path).lexically_normal().generic_string();
}

Result RealPath(const std::string& path, std::string& out) {
  boost::system::error_code error;
  out = boost::filesystem::canonical(path, error).generic_string();
  return Result::OfSystem(error.value());
}

namespace {

// A failure also when the directory could not be listed to its end.
template <typename Take>
Result ForEachEntry(const std::string& directory, Take take) {
  DIR* handle = opendir(directory.empty() ? "." : directory.c_str());
  if (!handle) return Result::OfCall(false);
  errno = 0;
  while (const dirent* entry = readdir(handle)) {
    take(*entry);
    errno = 0;
  }
  const Result listed = Result::OfSystem(errno);
  closedir(handle);
  return listed;
}

}  // namespace

Result EntryNames(const std::string& directory, std::vector<std::string>& names) {
  const Result listed = ForEachEntry(directory, [&](const dirent& entry) { names.emplace_back(entry.d_name); });
  std::sort(names.begin(), names.end());
  return listed;
}

std::vector<std::string> PlainFileNames(const std::string& directory) {
  std::vector<std::string> names;
  ForEachEntry(directory, [&](const dirent& entry) {
    if (entry.d_type == DT_REG) names.emplace_back(entry.d_name);
  });
  return names;
}

}  // namespace qrex::platform
