#include "platform/windows/api.h"

#include <algorithm>

namespace qrex::platform {

std::wstring Wide(std::string_view utf8) {
  if (utf8.empty()) return {};
  const int size = static_cast<int>(utf8.size());
  std::wstring text(utf8.size(), L'\0');
  const int length = MultiByteToWideChar(CP_UTF8, 0, utf8.data(), size, text.data(), size);
  text.resize(static_cast<size_t>(length));
  return text;
}

std::string Narrow(std::wstring_view text) {
  if (text.empty()) return {};
  constexpr size_t kMostBytes = 3;  // of one unit: two of them may take four
  std::string utf8(text.size() * kMostBytes, '\0');
  const int length = WideCharToMultiByte(CP_UTF8, 0, text.data(), static_cast<int>(text.size()), utf8.data(),
                                         static_cast<int>(utf8.size()), nullptr, nullptr);
  utf8.resize(static_cast<size_t>(length));
  return utf8;
}

namespace {

constexpr std::wstring_view kVerbatim = L"\\\\?\\", kVerbatimShare = L"\\\\?\\UNC\\", kShare = L"\\\\";

bool IsSlash(wchar_t c) { return c == L'/' || c == L'\\'; }
bool IsWhole(std::wstring_view path) {
  return path.size() >= 3 && (path[1] == L':' ? IsSlash(path[2]) : IsSlash(path[0]) && IsSlash(path[1]));
}

std::wstring WholePath(const std::wstring& path) {
  std::wstring whole(GetFullPathNameW(path.c_str(), 0, nullptr, nullptr), L'\0');
  whole.resize(GetFullPathNameW(path.c_str(), static_cast<DWORD>(whole.size()), whole.data(), nullptr));
  return whole;
}

}  // namespace

std::wstring WidePath(const std::string& path) {
  std::wstring wide = Wide(path);
  const size_t length = wide.size() + (IsWhole(wide) ? 0 : GetCurrentDirectoryW(0, nullptr));
  if (length < kLongPath) return wide;
  const std::wstring whole = WholePath(wide);
  if (whole.starts_with(kVerbatim) || whole.starts_with(L"\\\\.\\")) return whole;
  if (whole.starts_with(kShare)) return std::wstring(kVerbatimShare) + whole.substr(kShare.size());
  return std::wstring(kVerbatim) + whole;
}

std::string PathFrom(std::wstring_view path) {
  std::wstring text(path);
  if (path.starts_with(kVerbatimShare)) {
    text = std::wstring(kShare).append(path.substr(kVerbatimShare.size()));
  } else if (path.starts_with(kVerbatim)) {
    text = path.substr(kVerbatim.size());
  }
  std::replace(text.begin(), text.end(), L'\\', L'/');
  return Narrow(text);
}

Handle OpenFile(const std::string& path, DWORD access, DWORD disposition, DWORD flags, DWORD share) {
  return Handle(CreateFileW(WidePath(path).c_str(), access, share, nullptr, disposition, flags, nullptr));
}

}  // namespace qrex::platform
