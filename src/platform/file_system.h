// Files as the system below gives them.
//
// The read-only attribute is "no write permission bit is set". A read-only file refuses to be opened for writing also
// for the superuser, whom the permission bits would not stop.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "platform/error.h"

namespace qrex::platform {

constexpr size_t kLongestName = 255;  // of a file, in bytes

struct FileInfo {
  bool isDirectory = false;
  bool isPlain = false;  // a file of bytes: no directory, pipe, socket or device
  bool isReadOnly = false;
  bool isHidden = false;
  int64_t creationTime = 0;  // all times in 100 ns units since 1601
  int64_t accessTime = 0;
  int64_t writeTime = 0;
  uint64_t size = 0;
  std::string name;
};

Result Stat(const std::string& path, FileInfo& info);
// The stamp that a file gets which is written now: the clock of stamps moves in ticks, behind that of the system.
int64_t CurrentStamp();

// When a file was written, and how long it is. All 0: it is not there, or no plain file.
struct FileStamp {
  int64_t time = 0;  // 100 ns units since 1601
  uint64_t size = 0;
  bool operator==(const FileStamp&) const = default;
};

// The stamps of many files of one directory: cheaper than to walk each whole path.
class DirectoryTimes {
 public:
  explicit DirectoryTimes(const std::string& directory);
  ~DirectoryTimes();
  DirectoryTimes(const DirectoryTimes&) = delete;
  DirectoryTimes& operator=(const DirectoryTimes&) = delete;
  bool IsOpen() const { return m_handle != kNoHandle; }
  FileStamp StampOf(const char* name) const;

 private:
  std::string m_directory;  // where the system below has no calls that begin at an open directory
  intptr_t m_handle;
};

bool CanRead(const std::string& path);  // a plain file that opens for reading
bool IsReadOnlyFile(const std::string& path);
// A symbolic link, or a name of a file that has others: what is done to the file is done elsewhere too.
bool IsLink(const std::string& path);
// A pipe or device is read to its end, which may be waited for without end, only where the caller asks for it.
enum class Readable { PlainFile, AnyFile };
Result ReadFile(const std::string& path, std::string& content, Readable kind = Readable::PlainFile);
// Memory that is about to be filled is had faster in large pages. No more than a hint.
void PreferLargePages(void* memory, size_t size);
void ReserveText(std::string& text, size_t size);      // as reserve, in large pages where it is large
enum class Existing { Replaced, Continued, Refused };  // the content of what is there, read-only or not
Result WriteFile(const std::string& path, std::string_view content, Existing existing = Existing::Replaced);
Result MakeEmptyFile(const std::string& path, bool keepExisting);
Result RemoveFile(const std::string& path);  // of a link, the name alone
Result RemoveTree(const std::string& path);  // well also where there is none
Result RenameFile(const std::string& from, const std::string& to);
Result MakeDirectory(const std::string& path);
Result SetReadOnlyAttribute(const std::string& path, bool readOnly);  // a link is left alone
Result StampNow(const std::string& path);
Result SetWriteTime(const std::string& path, int64_t time);
Result CopyExecuteBits(const std::string& from, const std::string& to);
Result FullPath(const std::string& path, std::string& out);
std::string CollapseDots(std::string_view path);                                   // of its text alone
Result RealPath(const std::string& path, std::string& out);                        // with symbolic links resolved
Result EntryNames(const std::string& directory, std::vector<std::string>& names);  // with "." and "..", in byte order
std::vector<std::string> PlainFileNames(const std::string& directory);             // plain files alone, in no order

}  // namespace qrex::platform
