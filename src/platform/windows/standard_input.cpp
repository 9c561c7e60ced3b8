#include "platform/standard_input.h"

#include "platform/windows/api.h"

namespace qrex::platform {

namespace {

constexpr DWORD kChunk = 1 << 16;

bool ReadTyped(HANDLE input, std::string& bytes) {
  std::wstring text(kChunk / sizeof(wchar_t), L'\0');
  DWORD length = 0;
  if (!ReadConsoleW(input, text.data(), static_cast<DWORD>(text.size()), &length, nullptr)) return false;
  constexpr wchar_t kEnd = 26;  // Ctrl-Z
  if (length == 0 || text.front() == kEnd) return false;
  bytes += Narrow(std::wstring_view(text).substr(0, length));
  return true;
}

}  // namespace

bool ReadStdin(std::string& bytes) {
  const HANDLE input = GetStdHandle(STD_INPUT_HANDLE);
  DWORD mode, count = 0;
  if (GetConsoleMode(input, &mode)) return ReadTyped(input, bytes);
  const size_t size = bytes.size();
  bytes.resize(size + kChunk);
  if (!::ReadFile(input, bytes.data() + size, kChunk, &count, nullptr)) count = 0;
  bytes.resize(size + count);
  return count > 0;
}

}  // namespace qrex::platform
