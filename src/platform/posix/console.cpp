#include "platform/console.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <iterator>

#include "platform/terminal.h"

namespace qrex::platform {

void FillStandardHandles() {
  int number;
  do {
    number = open("/dev/null", O_RDWR);
  } while (number >= 0 && number <= STDERR_FILENO);
  if (number >= 0) close(number);
}

bool StdoutIsTerminal() { return isatty(STDOUT_FILENO) != 0; }

void WriteToOutput(std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t written = write(STDOUT_FILENO, bytes.data(), bytes.size());
    if (written > 0) bytes.remove_prefix(static_cast<size_t>(written));
    if (written >= 0 || errno == EINTR) continue;
    if (errno != EAGAIN) return;
    pollfd output{STDOUT_FILENO, POLLOUT, 0};  // a pipe that does not block, and is full
    poll(&output, 1, -1);
  }
}

bool TakesControlSequences() {
  const char* const kind = std::getenv("TERM");
  return StdoutIsTerminal() && kind && *kind != '\0' && std::string_view(kind) != "dumb";
}

size_t TerminalColumns() {
  winsize size = {};
  if (ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) != 0) return 0;
  constexpr size_t kUntold = 80;
  return size.ws_col == 0 ? kUntold : size.ws_col;
}

namespace {

constexpr int kEndingSignals[] = {SIGINT, SIGTERM, SIGHUP, SIGQUIT};
struct sigaction actionsBefore[std::size(kEndingSignals)];

void EndWithoutStatusLine(int signal) {  // its action is the system's own again
  if (isStatusDrawn != 0 && write(STDOUT_FILENO, kTakeBack.data(), kTakeBack.size()) < 0) {
  }
  raise(signal);
}

}  // namespace

// The signals of the process are those of what it was started with where they are ignored.
void WatchEnds() {
  for (size_t i = 0; i < std::size(kEndingSignals); ++i) {
    struct sigaction ends = {};
    ends.sa_handler = EndWithoutStatusLine;
    ends.sa_flags = static_cast<int>(SA_RESETHAND);
    sigaction(kEndingSignals[i], nullptr, &actionsBefore[i]);
    if (actionsBefore[i].sa_handler == SIG_DFL) sigaction(kEndingSignals[i], &ends, nullptr);
  }
}

void UnwatchEnds() {
  for (size_t i = 0; i < std::size(kEndingSignals); ++i) {
    if (actionsBefore[i].sa_handler == SIG_DFL) sigaction(kEndingSignals[i], &actionsBefore[i], nullptr);
  }
}

}  // namespace qrex::platform
