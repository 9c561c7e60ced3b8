#include "platform/console.h"

#include <algorithm>
#include <boost/locale/utf.hpp>
#include <chrono>
#include <cstdio>

#include "platform/system.h"
#include "platform/terminal.h"

namespace qrex::platform {

namespace utf = boost::locale::utf;

namespace {

// Length of the well-formed sequence at the head, 0 when there is none.
size_t SequenceLength(std::string_view text) {
  const char* at = text.data();
  const utf::code_point decoded = utf::utf_traits<char>::decode(at, text.data() + text.size());
  return utf::is_valid_codepoint(decoded) ? static_cast<size_t>(at - text.data()) : 0;
}

}  // namespace

bool IsValidUtf8(std::string_view text) {
  for (;;) {
    const auto isBeyondAscii = [](char c) { return (c & 0x80) != 0; };
    text.remove_prefix(static_cast<size_t>(std::find_if(text.begin(), text.end(), isBeyondAscii) - text.begin()));
    if (text.empty()) return true;
    const size_t length = SequenceLength(text);
    if (length == 0) return false;
    text.remove_prefix(length);
  }
}

std::string WidenBytes(std::string_view text) {
  std::string widened;
  while (!text.empty()) {
    size_t length = SequenceLength(text);
    if (length == 0) {
      const unsigned char byte = static_cast<unsigned char>(text.front());
      widened += static_cast<char>(0xC0 | byte >> 6);
      widened += static_cast<char>(0x80 | (byte & 0x3F));
      length = 1;
    } else {
      widened += text.substr(0, length);
    }
    text.remove_prefix(length);
  }
  return widened;
}

namespace {

// A character of a line that Unicode counts as wide takes two columns. Which ones these are differs from terminal to
// terminal: what begins where their blocks do counts as wide.
constexpr utf::code_point kFirstWide = 0x1100;

}  // namespace

size_t ColumnsOf(std::string_view text) {
  size_t columns = 0;
  for (const char *at = text.data(), *end = at + text.size(); at < end;) {
    columns += utf::utf_traits<char>::decode(at, end) < kFirstWide ? 1 : 2;
  }
  return columns;
}

namespace {

using Clock = std::chrono::steady_clock;

constexpr auto kMoment = std::chrono::milliseconds(50);
constexpr size_t kMostBuffered = 64 << 10;
bool isBuffered = false;
std::string buffered;
Clock::time_point lastWrite;

std::string statusLine;     // empty: none
bool isWithinLine = false;  // what was written last has no line end

}  // namespace

void BufferStdout() { isBuffered = !StdoutIsTerminal(); }

void FlushStdout() {
  if (buffered.empty()) return;
  WriteToOutput(buffered);
  buffered.clear();
  lastWrite = Clock::now();
}

void FlushAllStreams() { std::fflush(nullptr); }

size_t StatusColumns() { return TakesControlSequences() ? TerminalColumns() : 0; }

bool StdoutTakesColours() { return TakesControlSequences() && EnvironmentValue("NO_COLOR").value_or("").empty(); }

volatile std::sig_atomic_t isStatusDrawn = 0;

StatusLine::StatusLine() { WatchEnds(); }

StatusLine::~StatusLine() {
  HideStatusLine();
  UnwatchEnds();
}

void StatusLine::Show(std::string line) {
  if (line.empty()) return HideStatusLine();
  if (line == statusLine && isStatusDrawn != 0) return;
  statusLine = std::move(line);
  if (isWithinLine) return;  // drawn behind the rest of what is being written
  isStatusDrawn = 1;
  WriteToOutput(std::string(kTakeBack) + statusLine);
}

void HideStatusLine() {
  if (isStatusDrawn != 0) WriteToOutput(kTakeBack);
  isStatusDrawn = 0;
  statusLine.clear();
}

void WriteStdout(std::string_view bytes) {
  if (!bytes.empty()) isWithinLine = bytes.back() != '\n';
  if (!statusLine.empty() && !bytes.empty()) {
    std::string text = std::string(isStatusDrawn != 0 ? kTakeBack : "").append(bytes);
    isStatusDrawn = isWithinLine ? 0 : 1;
    if (!isWithinLine) text += statusLine;
    return WriteToOutput(text);
  }
  if (!isBuffered) return WriteToOutput(bytes);
  buffered += bytes;
  if (buffered.size() >= kMostBuffered || Clock::now() - lastWrite >= kMoment) FlushStdout();
}

}  // namespace qrex::platform
