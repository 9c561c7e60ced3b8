#include "platform/file_system.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <boost/filesystem.hpp>
#include <cerrno>
#include <cstdio>
#include <ctime>

#include "platform/error.h"

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

bool RefuseReadOnly(const std::string& path) {
  SetLastError(0);
  if (!IsReadOnlyFile(path)) return false;
  SetLastError(kErrorAccessDenied);
  return true;
}

}  // namespace

void PreferLargePages(void* memory, size_t size) {
  constexpr uintptr_t kPage = 4096;
  if (size < kLargePage) return;
  const uintptr_t begin = reinterpret_cast<uintptr_t>(memory) / kPage * kPage + kPage;
  madvise(reinterpret_cast<void*>(begin), size - kPage, MADV_HUGEPAGE);
}

void ReserveText(std::string& text, size_t size) {
  if (size >= kLargePage) size += kLargePage;  // so that the last of them holds the text's end
  text.reserve(size);
  PreferLargePages(text.data(), size);
}

bool Stat(const std::string& path, FileInfo& info) {
  SetLastError(0);
  struct stat status;
  if (stat(path.c_str(), &status) != 0) return false;
  info.isDirectory = S_ISDIR(status.st_mode);
  info.isPlain = S_ISREG(status.st_mode);
  info.isReadOnly = (status.st_mode & kWriteBits) == 0;
  info.creationTime = FileTime(status.st_ctim);
  info.accessTime = FileTime(status.st_atim);
  info.writeTime = FileTime(status.st_mtim);
  info.size = static_cast<uint64_t>(status.st_size);
  info.name = path.substr(path.rfind('/') + 1);
  info.isHidden = !info.name.empty() && info.name.front() == '.';
  return true;
}

int64_t CurrentStamp() {
  timespec now;
  clock_gettime(CLOCK_REALTIME_COARSE, &now);
  return FileTime(now);
}

DirectoryTimes::DirectoryTimes(const std::string& directory)
    : m_descriptor(open(directory.empty() ? "." : directory.c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC)) {}

DirectoryTimes::~DirectoryTimes() {
  if (IsOpen()) close(m_descriptor);
}

int64_t DirectoryTimes::WriteTimeOf(const char* name) const {
  struct stat status;
  const bool isFile = fstatat(m_descriptor, name, &status, 0) == 0 && S_ISREG(status.st_mode);
  return isFile ? FileTime(status.st_mtim) : 0;
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
  SetLastError(0);
  struct stat status;
  return lstat(path.c_str(), &status) == 0 && IsLink(status);
}

bool ReadFile(const std::string& path, std::string& content, Readable kind) {
  SetLastError(0);
  const bool plainOnly = kind == Readable::PlainFile;
  Descriptor file(path, O_RDONLY | (plainOnly ? O_NONBLOCK : 0));  // the open itself may wait for a pipe's writer
  struct stat status;
  if (!file || fstat(file.Number(), &status) != 0) return false;
  if (S_ISDIR(status.st_mode)) {
    errno = EISDIR;
    return false;
  }
  if (plainOnly && !S_ISREG(status.st_mode)) {
    errno = EACCES;
    return false;
  }
  // A file of the proc file system has no size, and one that grows has more: read to the end. Less than the size is a
  // fault, not the end.
  const size_t size = static_cast<size_t>(status.st_size);
  content.clear();
  ReserveText(content, size);
  char block[65536];
  for (;;) {
    const ssize_t got = read(file.Number(), block, sizeof block);
    if (got < 0 && errno == EINTR) continue;
    if (got < 0) return false;
    content.append(block, static_cast<size_t>(got));
    if (got > 0 && content.size() == size) return true;
    if (got > 0) continue;
    if (content.size() < size) errno = EIO;
    return content.size() >= size;
  }
}

bool WriteFile(const std::string& path, std::string_view content) {
  SetLastError(0);
  Descriptor file(path, O_WRONLY | O_CREAT | O_TRUNC);
  if (!file) return false;
  while (!content.empty()) {
    const ssize_t written = write(file.Number(), content.data(), content.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return false;
    content.remove_prefix(static_cast<size_t>(written));
  }
  return file.Close();
}

bool MakeEmptyFile(const std::string& path, bool keepExisting) {
  if (RefuseReadOnly(path)) return false;
  return static_cast<bool>(Descriptor(path, O_WRONLY | O_CREAT | (keepExisting ? 0 : O_EXCL)));
}

bool RemoveFile(const std::string& path) {
  if (!IsLink(path) && RefuseReadOnly(path)) return false;
  return unlink(path.c_str()) == 0;
}

bool RemoveTree(const std::string& path) {
  boost::system::error_code error;
  SetLastError(0);
  boost::filesystem::remove_all(path, error);
  errno = error.value();
  return !error;
}

bool RenameFile(const std::string& from, const std::string& to) {
  SetLastError(0);
  return std::rename(from.c_str(), to.c_str()) == 0;
}

bool MakeDirectory(const std::string& path) {
  SetLastError(0);
  return mkdir(path.c_str(), 0777) == 0;
}

bool SetReadOnlyAttribute(const std::string& path, bool readOnly) {
  SetLastError(0);
  struct stat status;
  if (lstat(path.c_str(), &status) != 0) return false;
  if (IsLink(status)) return true;
  if (((status.st_mode & kWriteBits) == 0) == readOnly) return true;
  return chmod(path.c_str(), readOnly ? status.st_mode & ~kWriteBits : status.st_mode | S_IWUSR) == 0;
}

bool CopyExecuteBits(const std::string& from, const std::string& to) {
  constexpr mode_t kExecuteBits = S_IXUSR | S_IXGRP | S_IXOTH;
  SetLastError(0);
  struct stat source, target;
  if (stat(from.c_str(), &source) != 0 || stat(to.c_str(), &target) != 0) return false;
  const mode_t bits = source.st_mode & kExecuteBits;
  return bits == 0 || chmod(to.c_str(), (target.st_mode | bits) & 07777) == 0;
}

bool StampNow(const std::string& path) {
  SetLastError(0);
  return utimensat(AT_FDCWD, path.c_str(), nullptr, 0) == 0;
}

bool SetWriteTime(const std::string& path, int64_t time) {
  SetLastError(0);
  const int64_t sinceEpoch = time - kUnixEpoch;
  const timespec stamp{sinceEpoch / kUnitsOfSecond, sinceEpoch % kUnitsOfSecond * 100};
  const timespec times[2] = {stamp, stamp};
  return utimensat(AT_FDCWD, path.c_str(), times, 0) == 0;
}

bool FullPath(const std::string& path, std::string& out) {
  boost::system::error_code error;
  const boost::filesystem::path full = boost::filesystem::absolute(path, error);
  if (path.empty() || error) return false;
  out = full.lexically_normal().generic_string();
  if (out.size() > 2 && out.compare(out.size() - 2, 2, "/.") == 0) out.resize(out.size() - 2);
  if (out.size() > 1 && out.back() == '/') out.pop_back();
  return true;
}

bool RealPath(const std::string& path, std::string& out) {
  boost::system::error_code error;
  SetLastError(0);
  out = boost::filesystem::canonical(path, error).generic_string();
  errno = error.value();
  return !error;
}

namespace {

// False when the directory could not be listed to its end.
template <typename Take>
bool ForEachEntry(const std::string& directory, Take take) {
  SetLastError(0);
  DIR* handle = opendir(directory.empty() ? "." : directory.c_str());
  if (!handle) return false;
  errno = 0;
  while (const dirent* entry = readdir(handle)) {
    take(*entry);
    errno = 0;
  }
  const int failure = errno;
  closedir(handle);
  errno = failure;
  return failure == 0;
}

}  // namespace

bool EntryNames(const std::string& directory, std::vector<std::string>& names) {
  const bool listed = ForEachEntry(directory, [&](const dirent& entry) { names.emplace_back(entry.d_name); });
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
