#include "platform/streams.h"

#include <fcntl.h>
#include <io.h>

#include <string_view>

#include "platform/windows/api.h"

namespace qrex::platform {

namespace {

CStream StreamOf(Handle file, int flags, const char* mode) {
  if (!file) return nullptr;
  const int number = _open_osfhandle(AsNumber(file.Get()), flags | _O_BINARY | _O_NOINHERIT);
  if (number < 0) return nullptr;
  file.Release();
  CStream stream(_fdopen(number, mode));
  if (!stream) _close(number);
  return stream;
}

}  // namespace

CStream OpenStream(const std::string& path, const char* mode) {
  switch (mode[0]) {
    case 'r':
      return StreamOf(OpenFile(path, GENERIC_READ, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL), _O_RDONLY, "rb");
    case 'w':
      return StreamOf(OpenFile(path, GENERIC_WRITE, CREATE_ALWAYS, FILE_ATTRIBUTE_NORMAL), _O_WRONLY, "wb");
    default:
      return StreamOf(OpenFile(path, FILE_APPEND_DATA, OPEN_ALWAYS, FILE_ATTRIBUTE_NORMAL), _O_WRONLY | _O_APPEND,
                      "ab");
  }
}

CStream OpenTemporary() {
  wchar_t folder[MAX_PATH + 1], path[MAX_PATH + 1];
  if (GetTempPathW(MAX_PATH + 1, folder) == 0 || GetTempFileNameW(folder, L"qrx", 0, path) == 0) return nullptr;
  constexpr DWORD kFlags = FILE_ATTRIBUTE_TEMPORARY | FILE_FLAG_DELETE_ON_CLOSE;
  Handle file(
      CreateFileW(path, GENERIC_READ | GENERIC_WRITE, FILE_SHARE_DELETE, nullptr, CREATE_ALWAYS, kFlags, nullptr));
  return StreamOf(std::move(file), _O_RDWR, "w+b");
}

}  // namespace qrex::platform
