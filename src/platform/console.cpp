#include "platform/console.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <boost/locale/utf.hpp>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstdlib>

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

namespace {

constexpr std::string_view kTakeBack = "\r\x1b[K";
std::string statusLine;     // empty: none
bool isWithinLine = false;  // what was written last has no line end
volatile std::sig_atomic_t isStatusDrawn = 0;

bool TakesControlSequences() {
  const char* const kind = std::getenv("TERM");
  return StdoutIsTerminal() && kind && *kind != '\0' && std::string_view(kind) != "dumb";
}

// A character of a line that Unicode counts as wide takes two columns. Which ones these are differs from terminal to
// terminal: what begins where their blocks do counts as wide.
constexpr utf::code_point kFirstWide = 0x1100;

constexpr int kEndingSignals[] = {SIGINT, SIGTERM, SIGHUP, SIGQUIT};
struct sigaction actionsBefore[std::size(kEndingSignals)];

void EndWithoutStatusLine(int signal) {  // its action is the system's own again
  if (isStatusDrawn != 0 && write(STDOUT_FILENO, kTakeBack.data(), kTakeBack.size()) < 0) {
  }
  raise(signal);
}

}  // namespace

size_t StatusColumns() {
  winsize size = {};
  if (!TakesControlSequences() || ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) != 0) return 0;
  constexpr size_t kUntold = 80;
  return size.ws_col == 0 ? kUntold : size.ws_col;
}

bool StdoutTakesColours() {
  const char* const refused = std::getenv("NO_COLOR");
  return TakesControlSequences() && (!refused || *refused == '\0');
}

size_t ColumnsOf(std::string_view text) {
  size_t columns = 0;
  for (const char *at = text.data(), *end = at + text.size(); at < end;) {
    columns += utf::utf_traits<char>::decode(at, end) < kFirstWide ? 1 : 2;
  }
  return columns;
}

// The signals of the process are those of what it was started with where they are ignored.
StatusLine::StatusLine() {
  for (size_t i = 0; i < std::size(kEndingSignals); ++i) {
    struct sigaction ends = {};
    ends.sa_handler = EndWithoutStatusLine;
    ends.sa_flags = static_cast<int>(SA_RESETHAND);
    sigaction(kEndingSignals[i], nullptr, &actionsBefore[i]);
    if (actionsBefore[i].sa_handler == SIG_DFL) sigaction(kEndingSignals[i], &ends, nullptr);
  }
}

StatusLine::~StatusLine() {
  HideStatusLine();
  for (size_t i = 0; i < std::size(kEndingSignals); ++i) {
    if (actionsBefore[i].sa_handler == SIG_DFL) sigaction(kEndingSignals[i], &actionsBefore[i], nullptr);
  }
}

void StatusLine::Show(std::string line) {
  if (line.empty()) return HideStatusLine();
  if (line == statusLine && isStatusDrawn != 0) return;
  statusLine = std::move(line);
  if (isWithinLine) return;  // drawn behind the rest of what is being written
  isStatusDrawn = 1;
  WriteAtOnce(std::string(kTakeBack) + statusLine);
}

void HideStatusLine() {
  if (isStatusDrawn != 0) WriteAtOnce(kTakeBack);
  isStatusDrawn = 0;
  statusLine.clear();
}

void WriteStdout(std::string_view bytes) {
  if (!bytes.empty()) isWithinLine = bytes.back() != '\n';
  if (!statusLine.empty() && !bytes.empty()) {
    std::string text = std::string(isStatusDrawn != 0 ? kTakeBack : "").append(bytes);
    isStatusDrawn = isWithinLine ? 0 : 1;
    if (!isWithinLine) text += statusLine;
    return WriteAtOnce(text);
  }
  if (!isBuffered) return WriteAtOnce(bytes);
  buffered += bytes;
  if (buffered.size() >= kMostBuffered || Clock::now() - lastWrite >= kMoment) FlushStdout();
}

}  // namespace qrex::platform
