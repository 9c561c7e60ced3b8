// The file system layer. All paths are UTF-8; a path that is not valid UTF-8 raises StringConversionException.
// Operations answer by result (a failure, false, 0, empty); only File and OFileStream raise FileException.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <vector>

#include "platform/buffered_file.h"
#include "platform/file_system.h"
#include "text/exceptions.h"
#include "text/streams.h"

namespace qrex {

using platform::FileStamp;

bool FileExists(const std::string& path);  // a plain file that opens for reading: no directory, pipe, socket, device
platform::Result DeleteFile(const std::string& path);
// The copy bears the time at which the reading began, so that what is written into the source behind that is newer. A
// program stays executable; a read-only target is replaced like any other, a link and not what it leads to.
platform::Result CopyFile(const std::string& from, const std::string& to, bool failIfExists, bool readOnly = false);
platform::Result CreateEmptyFile(const std::string& path, bool keepExisting);
void CreateDirectories(const std::string& path, bool includeLast);
platform::Result SetReadOnly(const std::string& path, bool readOnly);
FileStamp StampOf(const std::string& path);
int64_t LastWriteTime(const std::string& path);  // 100 ns units since 1601; 0 for a missing and for no plain file
// The same for many files of few directories, which must stay where they are meanwhile.
class FileTimes {
 public:
  FileTimes();
  ~FileTimes();
  FileStamp StampOf(const std::string& path);
  int64_t LastWriteTime(const std::string& path) { return StampOf(path).time; }

 private:
  static constexpr size_t kMostDirectories = 64;  // each takes a descriptor
  std::unordered_map<std::string, std::unique_ptr<platform::DirectoryTimes>> m_directories;
  decltype(m_directories)::value_type* m_last = nullptr;  // of the file that was asked for last
};
std::vector<FileStamp> StampsOf(const std::vector<std::string>& paths);  // of many files, by several threads
platform::Result TouchFile(const std::string& path, bool create);
int64_t CurrentStamp();  // that a file gets which is written now, on a file system with fine stamps
// A time that was taken by this clock as the file system would have stamped it which gave `stamp`: some keep whole
// seconds or two.
int64_t OnScaleOf(int64_t stamp, int64_t time);
platform::Result FullPathOf(const std::string& path, std::string& out);
platform::Result RealPathOf(const std::string& path, std::string& out);  // as FullPathOf, with symbolic links resolved
platform::Result ReadWholeFile(std::string& out, const std::string& path);
bool LoadText(std::string& out, const std::string& path, bool foldLineEnds);  // CR LF and lone CR to LF when folding
void FoldLineEnds(std::string& text);                                         // in place: CR LF and a lone CR become LF
bool LoadStream(std::string& out, const std::string& path);  // as LoadText with folding, also from a pipe or device

// Removes what killed runs left where they were writing. One for each run: it looks through each folder once.
class LeftoverSweep {
 public:
  void Beside(const std::string& path);  // to be called ahead of writing a file
  size_t WriteCount() const { return m_writeCount; }

 private:
  std::unordered_set<std::string> m_swept;  // folders, with a slash at the end
  size_t m_writeCount = 0;
};

// Replaces the file as a whole: written beside, then renamed, so that there is never a half-written file at `path`.
// Raises FileException. A read-only target fails with code 5, unless the flag is the caller's own: it was cleared, but
// another run may just have set it again.
enum class ReadOnlyTarget { Refuse, Replace };
void ReplaceFile(const std::string& path, std::string_view content, ReadOnlyTarget readOnly = ReadOnlyTarget::Refuse);

// The same for a file that only this process and its tools read: where there is none yet, it is written in place.
void ReplaceOwnFile(const std::string& path, std::string_view content);

uint32_t Crc32(std::string_view bytes);  // IEEE 802.3
// A 16-byte header (magic, CRC-32 by IEEE 802.3, signed 64-bit size, all little-endian), then the payload.
bool ReadCheckedFile(uint32_t magic, std::string& payload, const std::string& path);
// Raises FileException. A file that holds the same already is not replaced, but gets the present time.
void WriteCheckedFile(uint32_t magic, std::string_view payload, const std::string& path);

enum class FileMode { Closed = -1, ReadText, WriteText, AppendText, ReadBinary, WriteBinary, AppendBinary };

class IFile : public ISeekableInputStream, public IOutputStream {
 public:
  virtual void Close() = 0;
  virtual bool IsWritable() = 0;
};

class File : public IFile {
 public:
  File() = default;
  File(const std::string& path, FileMode mode);  // raises FileException with code 2
  ~File() override;
  platform::Result Open(const std::string& path, FileMode mode);
  size_t Read(void* buffer, size_t length) override;
  int64_t Length() override;  // bytes written so far
  int64_t Position() override;
  bool Seek(int64_t position) override;
  void Write(const void* data, size_t length) override;
  void Flush() override;  // this and Close raise FileException where bytes that were written before get lost
  void Close() override;
  bool IsWritable() override;

 private:
  [[noreturn]] void FailWrite() const;
  platform::BufferedFile m_file;
  FileMode m_mode = FileMode::Closed;
  std::string m_path;
  int64_t m_bytesWritten = 0;
};

class IFileOrDirInfo {
 public:
  virtual ~IFileOrDirInfo() = default;
  virtual bool IsArchive() const = 0;
  virtual bool IsCompressed() const = 0;
  virtual bool IsDirectory() const = 0;
  virtual bool IsEncrypted() const = 0;
  virtual bool IsHidden() const = 0;
  virtual bool IsOffline() const = 0;
  virtual bool IsReadOnly() const = 0;
  virtual bool IsSparse() const = 0;
  virtual bool IsSystem() const = 0;
  virtual int64_t CreationTime() const = 0;
  virtual int64_t LastAccessTime() const = 0;
  virtual int64_t LastWriteTime() const = 0;
  virtual uint32_t SizeLow() const = 0;
  virtual std::string Name() const = 0;
};

// The entries of a directory, "." and ".." included, in byte order of their names.
class FileOrDirIterator {
 public:
  explicit FileOrDirIterator(const std::string& pattern);  // "dir/*"
  ~FileOrDirIterator();
  const IFileOrDirInfo* Next();   // null at the end; valid until the next call
  uint32_t FailureCode() const;   // of the system, when the directory could not be listed; else 0
  uint32_t EntryFailure() const;  // the same of the entry that Next gave: then its name is all that is known of it

 private:
  struct State;
  std::unique_ptr<State> m_state;
};

}  // namespace qrex
