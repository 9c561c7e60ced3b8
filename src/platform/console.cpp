#include "platform/console.h"

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <boost/locale/utf.hpp>
#include <cerrno>
#include <chrono>
#include <cstdio>

namespace qrex::platform {

namespace {

// Length of the well-formed sequence at the head, 0 when there is none.
size_t SequenceLength(std::string_view text) {
  namespace utf = boost::locale::utf;
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

void FillStandardHandles() {
  int number;
  do {
    number = open("/dev/null", O_RDWR);
  } while (number >= 0 && number <= STDERR_FILENO);
  if (number >= 0) close(number);
}

bool StdoutIsTerminal() { return isatty(STDOUT_FILENO) != 0; }

namespace {

using Clock = std::chrono::steady_clock;

constexpr auto kMoment = std::chrono::milliseconds(50);
constexpr size_t kMostBuffered = 64 << 10;
bool isBuffered = false;
std::string buffered;
Clock::time_point lastWrite;

void WriteAtOnce(std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t written = write(STDOUT_FILENO, bytes.data(), bytes.size());
    if (written > 0) bytes.remove_prefix(static_cast<size_t>(written));
    if (written >= 0 || errno == EINTR) continue;
    if (errno != EAGAIN) return;
    pollfd output{STDOUT_FILENO, POLLOUT, 0};  // a pipe that does not block, and is full
    poll(&output, 1, -1);
  }
}

}  // namespace

void BufferStdout() { isBuffered = !StdoutIsTerminal(); }

void FlushStdout() {
  if (buffered.empty()) return;
  WriteAtOnce(buffered);
  buffered.clear();
  lastWrite = Clock::now();
}

void FlushAllStreams() { std::fflush(nullptr); }

void WriteStdout(std::string_view bytes) {
  if (!isBuffered) return WriteAtOnce(bytes);
  buffered += bytes;
  if (buffered.size() >= kMostBuffered || Clock::now() - lastWrite >= kMoment) FlushStdout();
}

}  // namespace qrex::platform
