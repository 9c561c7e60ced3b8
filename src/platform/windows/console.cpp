#include "platform/console.h"

#include <io.h>

#include <algorithm>
#include <cstdio>

#include "platform/system.h"
#include "platform/terminal.h"
#include "platform/windows/api.h"

namespace qrex::platform {

namespace {

HANDLE Output() { return GetStdHandle(STD_OUTPUT_HANDLE); }

void WriteBytes(std::string_view bytes) {
  while (!bytes.empty()) {
    DWORD written = 0;
    if (!::WriteFile(Output(), bytes.data(), static_cast<DWORD>(bytes.size()), &written, nullptr) || written == 0)
      return;
    bytes.remove_prefix(written);
  }
}

void WriteToConsoleWindow(std::string_view bytes) {
  constexpr size_t kMost = 16384;
  while (!bytes.empty()) {
    size_t length = std::min(bytes.size(), kMost);
    while (length < bytes.size() && length > kMost - 4 && (bytes[length] & 0xC0) == 0x80) --length;  // whole characters
    const std::wstring text = Wide(bytes.substr(0, length));
    DWORD written = 0;
    if (!WriteConsoleW(Output(), text.data(), static_cast<DWORD>(text.size()), &written, nullptr)) return;
    bytes.remove_prefix(length);
  }
}

// Whoever reads what was redirected reads it as the console would show it; without a console there is nothing to go by.
void WriteRedirected(std::string_view bytes) {
  const UINT codePage = GetConsoleOutputCP();
  const auto isAscii = [](char c) { return (c & 0x80) == 0; };
  if (codePage == 0 || codePage == CP_UTF8 || std::all_of(bytes.begin(), bytes.end(), isAscii))
    return WriteBytes(bytes);
  const std::wstring text = Wide(bytes);
  const int length = static_cast<int>(text.size());
  std::string converted(
      static_cast<size_t>(WideCharToMultiByte(codePage, 0, text.data(), length, nullptr, 0, nullptr, nullptr)), '\0');
  WideCharToMultiByte(codePage, 0, text.data(), length, converted.data(), static_cast<int>(converted.size()), nullptr,
                      nullptr);
  WriteBytes(converted);
}

}  // namespace

void FillStandardHandles() {}  // no other handle takes the place of one that is missing

bool StdoutIsTerminal() {
  DWORD mode;
  return GetConsoleMode(Output(), &mode) != 0;
}

void WriteToOutput(std::string_view bytes) {
  if (StdoutIsTerminal()) return WriteToConsoleWindow(bytes);
  WriteRedirected(bytes);
}

bool TakesControlSequences() {
  DWORD mode;
  if (!GetConsoleMode(Output(), &mode) || EnvironmentValue("TERM") == "dumb") return false;
  return SetConsoleMode(Output(), mode | ENABLE_PROCESSED_OUTPUT | ENABLE_VIRTUAL_TERMINAL_PROCESSING) != 0;
}

size_t TerminalColumns() {
  CONSOLE_SCREEN_BUFFER_INFO info;
  if (!GetConsoleScreenBufferInfo(Output(), &info)) return 0;
  return static_cast<size_t>(std::max(0, info.srWindow.Right - info.srWindow.Left + 1));
}

namespace {

BOOL WINAPI EndWithoutStatusLine(DWORD) {
  if (isStatusDrawn != 0) WriteToOutput(kTakeBack);
  isStatusDrawn = 0;
  return FALSE;  // and on to the next handler, at last the system's, which ends the process
}

}  // namespace

void WatchEnds() { SetConsoleCtrlHandler(EndWithoutStatusLine, TRUE); }
void UnwatchEnds() { SetConsoleCtrlHandler(EndWithoutStatusLine, FALSE); }

}  // namespace qrex::platform
