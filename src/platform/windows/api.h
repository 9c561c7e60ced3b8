// The calls of Windows: texts are UTF-16 there, handles are closed by their owner.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

#ifndef NOMINMAX
#define NOMINMAX
#endif
#define WIN32_LEAN_AND_MEAN
#include <windows.h>

namespace qrex::platform {

std::wstring Wide(std::string_view utf8);  // what is no UTF-8 becomes U+FFFD
std::string Narrow(std::wstring_view text);

// As the calls of the system take a path. Where the whole one has this length or more, they take it in the form without
// a limit alone, which has to be whole and knows no "..": a folder may have 247 characters else, a file 259.
constexpr size_t kLongPath = 248;
std::wstring WidePath(const std::string& path);
// As the rest of the program has it: of what the system tells, without the marks of that form, with slashes.
std::string PathFrom(std::wstring_view path);

// Null is no handle, and neither is what failed calls return.
class Handle {
 public:
  Handle() = default;
  explicit Handle(HANDLE handle) : m_handle(handle == INVALID_HANDLE_VALUE ? nullptr : handle) {}
  Handle(Handle&& other) noexcept : m_handle(std::exchange(other.m_handle, nullptr)) {}
  Handle& operator=(Handle&& other) noexcept {
    std::swap(m_handle, other.m_handle);
    return *this;
  }
  ~Handle() { Close(); }

  explicit operator bool() const { return m_handle != nullptr; }
  HANDLE Get() const { return m_handle; }
  HANDLE Release() { return std::exchange(m_handle, nullptr); }
  void Close() {
    if (m_handle) CloseHandle(std::exchange(m_handle, nullptr));
  }

 private:
  HANDLE m_handle = nullptr;
};

inline HANDLE AsHandle(intptr_t number) { return reinterpret_cast<HANDLE>(number); }
inline intptr_t AsNumber(HANDLE handle) { return reinterpret_cast<intptr_t>(handle); }

constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;
// Without FILE_FLAG_BACKUP_SEMANTICS no folder is opened.
Handle OpenFile(const std::string& path, DWORD access, DWORD disposition, DWORD flags, DWORD share = kShareAll);

inline int64_t FileTimeOf(const FILETIME& time) {
  return static_cast<int64_t>(uint64_t{time.dwHighDateTime} << 32 | time.dwLowDateTime);
}

}  // namespace qrex::platform
