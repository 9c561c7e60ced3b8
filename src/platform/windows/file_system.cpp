#include "platform/file_system.h"

#include <algorithm>
#include <filesystem>

#include "platform/streams.h"
#include "platform/system.h"
#include "platform/windows/api.h"
#include "platform/windows/patience.h"

namespace qrex::platform {

namespace {

constexpr DWORD kNone = INVALID_FILE_ATTRIBUTES;
constexpr DWORD kHinders =
    FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM;  // of being replaced

Result Refused() { return Result::Failure(kErrorAccessDenied); }

bool IsDisk(const Handle& file) { return GetFileType(file.Get()) == FILE_TYPE_DISK; }

// A name such as "nul" or "com1", in any folder: only the system knows which ones it takes for a device.
bool IsDevice(const std::string& path) {
  constexpr size_t kShortest = 3, kLongest = 7;
  const std::string_view name = std::string_view(path).substr(path.find_last_of("/\\:") + 1);
  const size_t length = std::min(name.find('.'), name.size());
  if (length < kShortest || length > kLongest) return false;
  wchar_t whole[MAX_PATH];
  const DWORD size = GetFullPathNameW(Wide(path).c_str(), MAX_PATH, whole, nullptr);
  return size > 0 && size < MAX_PATH && std::wstring_view(whole).starts_with(L"\\\\.\\");
}

Handle OpenAttributes(const std::string& path, DWORD access, DWORD flags = 0) {
  return OpenFile(path, access, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS | flags);
}

bool AttributesOf(const std::string& path, WIN32_FILE_ATTRIBUTE_DATA& data) {
  if (!GetFileAttributesExW(WidePath(path).c_str(), GetFileExInfoStandard, &data)) return false;
  if ((data.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) == 0) return true;
  const Handle target = OpenAttributes(path, FILE_READ_ATTRIBUTES);
  BY_HANDLE_FILE_INFORMATION info;
  if (!target || !GetFileInformationByHandle(target.Get(), &info)) return false;
  data = {info.dwFileAttributes, info.ftCreationTime, info.ftLastAccessTime,
          info.ftLastWriteTime,  info.nFileSizeHigh,  info.nFileSizeLow};
  return true;
}

DWORD OwnAttributes(const std::string& path) { return GetFileAttributesW(WidePath(path).c_str()); }

Result SetAttributes(const std::string& path, DWORD attributes) {
  constexpr DWORD kSettable = kHinders | FILE_ATTRIBUTE_ARCHIVE | FILE_ATTRIBUTE_NOT_CONTENT_INDEXED;
  const DWORD kept = attributes & kSettable;
  return Result::OfCall(SetFileAttributesW(WidePath(path).c_str(), kept == 0 ? FILE_ATTRIBUTE_NORMAL : kept) != 0);
}

uint64_t SizeOf(const WIN32_FILE_ATTRIBUTE_DATA& data) {
  return uint64_t{data.nFileSizeHigh} << 32 | data.nFileSizeLow;
}

}  // namespace

void PreferLargePages(void*, size_t) {}
void ReserveText(std::string& text, size_t size) { text.reserve(size); }

Result Stat(const std::string& path, FileInfo& info) {
  WIN32_FILE_ATTRIBUTE_DATA data;
  if (!AttributesOf(path, data)) return Result::OfCall(false);
  info.isDirectory = (data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  info.isPlain = !info.isDirectory && !IsDevice(path);
  info.isReadOnly = (data.dwFileAttributes & FILE_ATTRIBUTE_READONLY) != 0;
  info.creationTime = FileTimeOf(data.ftCreationTime);
  info.accessTime = FileTimeOf(data.ftLastAccessTime);
  info.writeTime = FileTimeOf(data.ftLastWriteTime);
  info.size = SizeOf(data);
  info.name = path.substr(path.find_last_of("/\\") + 1);
  const bool hasDot = !info.name.empty() && info.name.front() == '.';  // hidden wherever else the folder is seen
  info.isHidden = hasDot || (data.dwFileAttributes & FILE_ATTRIBUTE_HIDDEN) != 0;
  return {};
}

// The clock that files are stamped by may be a tick behind that of the system: that of a machine below, or of a share.
int64_t CurrentStamp() {
  constexpr int64_t kSlowestTick = 100'000;  // 10 ms
  return SystemFileTime() - kSlowestTick;
}

// The system has no documented calls that begin at an open folder.
DirectoryTimes::DirectoryTimes(const std::string& directory) : m_directory(directory), m_handle(kNoHandle) {
  FileInfo info;
  if (!directory.empty() && directory.back() != '/') m_directory += '/';
  if (Stat(directory.empty() ? "." : directory, info) && info.isDirectory) m_handle = 0;
}

DirectoryTimes::~DirectoryTimes() = default;

FileStamp DirectoryTimes::StampOf(const char* name) const {
  FileInfo info;
  return Stat(m_directory + name, info) && info.isPlain ? FileStamp{info.writeTime, info.size} : FileStamp();
}

bool CanRead(const std::string& path) {
  FileInfo info;
  return Stat(path, info) && info.isPlain && OpenFile(path, GENERIC_READ, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL);
}

bool IsReadOnlyFile(const std::string& path) {
  FileInfo info;
  return Stat(path, info) && !info.isDirectory && info.isReadOnly;
}

bool IsLink(const std::string& path) {
  const DWORD attributes = OwnAttributes(path);
  if (attributes == kNone) return false;
  const Handle file = OpenAttributes(path, FILE_READ_ATTRIBUTES, FILE_FLAG_OPEN_REPARSE_POINT);
  if ((attributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0) {  // which a file in a cloud has as well
    FILE_ATTRIBUTE_TAG_INFO tag;
    const bool isTold = GetFileInformationByHandleEx(file.Get(), FileAttributeTagInfo, &tag, sizeof tag) != 0;
    return isTold && (tag.ReparseTag == IO_REPARSE_TAG_SYMLINK || tag.ReparseTag == IO_REPARSE_TAG_MOUNT_POINT);
  }
  BY_HANDLE_FILE_INFORMATION info;
  return (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0 && GetFileInformationByHandle(file.Get(), &info) &&
         info.nNumberOfLinks > 1;
}

Result ReadFile(const std::string& path, std::string& content, Readable kind) {
  const Handle file = OpenFile(path, GENERIC_READ, OPEN_EXISTING, FILE_FLAG_SEQUENTIAL_SCAN);
  if (!file) return Result::OfCall(false);
  const bool isDisk = IsDisk(file);
  if (kind == Readable::PlainFile && !isDisk) return Refused();
  LARGE_INTEGER size = {};
  if (isDisk && !GetFileSizeEx(file.Get(), &size)) return Result::OfCall(false);
  content.clear();
  ReserveText(content, static_cast<size_t>(size.QuadPart));
  char block[65536];
  for (DWORD got = 0;;) {
    if (!::ReadFile(file.Get(), block, sizeof block, &got, nullptr)) {
      if (GetLastError() != ERROR_BROKEN_PIPE) return Result::OfCall(false);
      got = 0;
    }
    if (got == 0) return Result::OfSystem(content.size() < static_cast<uint64_t>(size.QuadPart) ? ERROR_READ_FAULT : 0);
    content.append(block, got);
  }
}

Result WriteFile(const std::string& path, std::string_view content, Existing existing) {
  const bool continues = existing == Existing::Continued;
  const DWORD how = continues ? OPEN_ALWAYS : existing == Existing::Refused ? CREATE_NEW : CREATE_ALWAYS;
  auto create = [&] {
    return OpenFile(path, continues ? FILE_APPEND_DATA : GENERIC_WRITE, how, FILE_ATTRIBUTE_NORMAL);
  };
  Handle file = create();
  if (!file && GetLastError() == ERROR_ACCESS_DENIED) {
    const DWORD attributes = OwnAttributes(path);
    if (attributes == kNone || (attributes & kHinders) == 0 || !SetAttributes(path, 0)) return Refused();
    file = create();
  }
  if (!file) return Result::OfCall(false);
  if (!IsDisk(file)) return Refused();
  constexpr size_t kMost = 1 << 30;
  while (!content.empty()) {
    DWORD written = 0;
    const DWORD wanted = static_cast<DWORD>(std::min(content.size(), kMost));
    if (!::WriteFile(file.Get(), content.data(), wanted, &written, nullptr)) return Result::OfCall(false);
    content.remove_prefix(written);
  }
  return {};
}

Result MakeEmptyFile(const std::string& path, bool keepExisting) {
  if (IsReadOnlyFile(path)) return Refused();
  return Result::OfCall(static_cast<bool>(
      OpenFile(path, GENERIC_WRITE, keepExisting ? OPEN_ALWAYS : CREATE_NEW, FILE_ATTRIBUTE_NORMAL, 0)));
}

Result RemoveFile(const std::string& path) {
  const DWORD attributes = OwnAttributes(path);
  const bool isLink = IsLink(path);
  const std::wstring wide = WidePath(path);
  if (isLink && (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0)
    return Result::OfCall(RemoveDirectoryW(wide.c_str()) != 0);
  if (!isLink && attributes != kNone && (attributes & FILE_ATTRIBUTE_READONLY) != 0) return Refused();
  // The attribute belongs to the file that other names lead to, and is in the way here alone.
  const bool isReadOnlyLink = isLink && (attributes & FILE_ATTRIBUTE_READONLY) != 0;
  Handle file;
  if (isReadOnlyLink) {
    file = OpenAttributes(path, FILE_WRITE_ATTRIBUTES, FILE_FLAG_OPEN_REPARSE_POINT);
    SetAttributes(path, attributes & ~DWORD{FILE_ATTRIBUTE_READONLY});
  }
  const Result removed = Patiently([&] { return Result::OfCall(DeleteFileW(wide.c_str()) != 0); });
  if (isReadOnlyLink) {
    FILE_BASIC_INFO asBefore = {};
    asBefore.FileAttributes = attributes & ~DWORD{FILE_ATTRIBUTE_REPARSE_POINT};
    SetFileInformationByHandle(file.Get(), FileBasicInfo, &asBefore, sizeof asBefore);
  }
  return removed;
}

// What was made read-only goes as well, as it does on other systems.
Result RemoveTree(const std::string& path) {
  const DWORD attributes = OwnAttributes(path);
  if (attributes == kNone) return {};
  const bool isFolder = (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  if (isFolder && !IsLink(path)) {
    std::vector<std::string> names;
    if (const Result listed = EntryNames(path, names); !listed) return listed;
    for (const std::string& name : names) {
      if (name == "." || name == "..") continue;
      if (const Result removed = RemoveTree(path + "/" + name); !removed) return removed;
    }
    return Patiently([&] { return Result::OfCall(RemoveDirectoryW(WidePath(path).c_str()) != 0); });
  }
  if ((attributes & FILE_ATTRIBUTE_READONLY) != 0 && !IsLink(path)) SetAttributes(path, 0);
  return RemoveFile(path);
}

// Attributes of what is replaced are in the way, where they are none of what is done.
Result RenameFile(const std::string& from, const std::string& to) {
  const DWORD attributes = OwnAttributes(to);
  const bool isHindered =
      attributes != kNone && (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0 && (attributes & kHinders);
  if (isHindered && IsLink(to)) {  // they belong to what other names lead to
    if (const Result removed = RemoveFile(to); !removed) return removed;
  } else if (isHindered) {
    SetAttributes(to, attributes & ~kHinders);
  }
  const std::wstring source = WidePath(from), target = WidePath(to);
  const Result renamed = Patiently(
      [&] { return Result::OfCall(MoveFileExW(source.c_str(), target.c_str(), MOVEFILE_REPLACE_EXISTING) != 0); });
  if (!renamed && isHindered) SetAttributes(to, attributes);
  return renamed;
}

Result MakeDirectory(const std::string& path) {
  return Result::OfCall(CreateDirectoryW(WidePath(path).c_str(), nullptr) != 0);
}

Result SetReadOnlyAttribute(const std::string& path, bool readOnly) {
  const DWORD attributes = OwnAttributes(path);
  if (attributes == kNone) return Result::OfCall(false);
  if (((attributes & FILE_ATTRIBUTE_READONLY) != 0) == readOnly || IsLink(path)) return {};
  return SetAttributes(path, attributes ^ FILE_ATTRIBUTE_READONLY);
}

Result CopyExecuteBits(const std::string&, const std::string&) { return {}; }  // what can be run, its name tells

Result SetWriteTime(const std::string& path, int64_t time) {
  const Handle file = OpenAttributes(path, FILE_WRITE_ATTRIBUTES);
  const uint64_t units = static_cast<uint64_t>(time);
  const FILETIME stamp = {static_cast<DWORD>(units), static_cast<DWORD>(units >> 32)};
  return Result::OfCall(file && SetFileTime(file.Get(), nullptr, &stamp, &stamp));
}

Result StampNow(const std::string& path) { return SetWriteTime(path, SystemFileTime()); }

Result FullPath(const std::string& path, std::string& out) {
  const std::wstring wide = Wide(path);
  std::wstring whole(path.empty() ? 0 : GetFullPathNameW(wide.c_str(), 0, nullptr, nullptr), L'\0');
  if (whole.empty()) return Result::Failure(kErrorFileNotFound);
  whole.resize(GetFullPathNameW(wide.c_str(), static_cast<DWORD>(whole.size()), whole.data(), nullptr));
  out = PathFrom(whole);
  constexpr size_t kDriveRoot = 3;
  if (out.size() > kDriveRoot && out.back() == '/') out.pop_back();
  return {};
}

namespace {

bool MayHaveDots(std::string_view path) {
  if (path.starts_with('.')) return true;
  for (size_t at = path.find_first_of("/\\"); at < path.size(); at = path.find_first_of("/\\", at + 1)) {
    const std::string_view behind = path.substr(at + 1);
    if (path[at] == '\\' || behind.starts_with('.') || behind.starts_with('/')) return true;
  }
  return false;
}

}  // namespace

std::string CollapseDots(std::string_view path) {
  if (!path.empty() && !MayHaveDots(path)) return std::string(path);
  const std::filesystem::path collapsed = std::filesystem::path(Wide(path)).lexically_normal();
  return PathFrom(collapsed.native());
}

Result RealPath(const std::string& path, std::string& out) {
  const Handle file = OpenAttributes(path, 0);
  if (!file) return Result::OfCall(false);
  std::wstring real(GetFinalPathNameByHandleW(file.Get(), nullptr, 0, FILE_NAME_NORMALIZED), L'\0');
  real.resize(
      GetFinalPathNameByHandleW(file.Get(), real.data(), static_cast<DWORD>(real.size()), FILE_NAME_NORMALIZED));
  out = PathFrom(real);
  const bool isPlace = out.starts_with("//") || (out.size() > 1 && out[1] == ':');
  return isPlace ? Result() : FullPath(path, out);  // others may not tell, or a name that only the system can open
}

namespace {

// A failure also when the directory could not be listed to its end.
template <typename Take>
Result ForEachEntry(const std::string& directory, Take take) {
  const std::string pattern = (directory.empty() ? "." : directory) + "/*";
  WIN32_FIND_DATAW entry;
  const HANDLE listing = FindFirstFileW(WidePath(pattern).c_str(), &entry);
  if (listing == INVALID_HANDLE_VALUE) return Result::OfCall(false);
  do {
    take(entry);
  } while (FindNextFileW(listing, &entry));
  const DWORD error = GetLastError();
  FindClose(listing);
  return Result::OfSystem(error == ERROR_NO_MORE_FILES ? 0 : static_cast<int>(error));
}

}  // namespace

Result EntryNames(const std::string& directory, std::vector<std::string>& names) {
  const Result listed =
      ForEachEntry(directory, [&](const WIN32_FIND_DATAW& entry) { names.push_back(Narrow(entry.cFileName)); });
  std::sort(names.begin(), names.end());
  return listed;
}

std::vector<std::string> PlainFileNames(const std::string& directory) {
  constexpr DWORD kOthers = FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT;
  std::vector<std::string> names;
  ForEachEntry(directory, [&](const WIN32_FIND_DATAW& entry) {
    if ((entry.dwFileAttributes & kOthers) == 0) names.push_back(Narrow(entry.cFileName));
  });
  return names;
}

}  // namespace qrex::platform
