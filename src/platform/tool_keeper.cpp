#include "platform/tool_keeper.h"

#include <dirent.h>
#include <fcntl.h>
#include <poll.h>
#include <sys/prctl.h>
#include <sys/signalfd.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <map>
#include <set>
#include <vector>

namespace qrex::platform {

namespace {

constexpr int kEndedBySignal = 128;  // plus the signal, as the shell has it

// A request is its size and the line and the environment as strings that end in 0; an empty one says goodbye. Each is
// answered by a Reply, in the order in which the tools end.
struct Reply {
  uint32_t request = 0;  // its number, from 0
  int32_t error = 0;     // why the tool could not be started
  int32_t status = 0;    // as `waitpid` tells it
};

bool SendAll(int socket, const void* data, size_t size) {
  for (const char* at = static_cast<const char*>(data); size > 0;) {
    const ssize_t sent = send(socket, at, size, MSG_NOSIGNAL);
    if (sent < 0 && errno == EINTR) continue;
    if (sent <= 0) return false;
    at += sent;
    size -= static_cast<size_t>(sent);
  }
  return true;
}

bool ReceiveAll(int socket, void* data, size_t size) {
  for (char* at = static_cast<char*>(data); size > 0;) {
    const ssize_t got = recv(socket, at, size, 0);
    if (got < 0 && errno == EINTR) continue;
    if (got <= 0) return false;
    at += got;
    size -= static_cast<size_t>(got);
  }
  return true;
}

int CodeOf(int status) { return WIFEXITED(status) ? WEXITSTATUS(status) : kEndedBySignal + WTERMSIG(status); }

// --- The keeper's side

pid_t ParentOf(const char* process) {
  const std::string path = "/proc/" + std::string(process) + "/stat";
  char text[512];
  const int file = open(path.c_str(), O_RDONLY | O_CLOEXEC);
  if (file < 0) return 0;
  const ssize_t length = read(file, text, sizeof text);
  close(file);
  const std::string_view line(text, static_cast<size_t>(std::max<ssize_t>(length, 0)));
  const size_t name = line.rfind(')');  // "1234 (name) S 1233 ..."; anything may stand in the name
  if (name == std::string_view::npos || name + 4 >= line.size()) return 0;
  return static_cast<pid_t>(std::atol(std::string(line.substr(name + 4)).c_str()));
}

std::vector<pid_t> Children() {
  std::vector<pid_t> children;
  DIR* const processes = opendir("/proc");
  if (!processes) return children;
  while (const dirent* entry = readdir(processes)) {
    if (entry->d_name[0] < '1' || entry->d_name[0] > '9') continue;
    if (ParentOf(entry->d_name) == getpid()) children.push_back(static_cast<pid_t>(std::atol(entry->d_name)));
  }
  closedir(processes);
  return children;
}

class Keeper {
 public:
  Keeper(int socket, pid_t toolGroup) : m_socket(socket), m_toolGroup(toolGroup) {
    setpgid(0, 0);
    prctl(PR_SET_NAME, "qrex-keeper");  // not met by who kills this program by its name
    prctl(PR_SET_CHILD_SUBREAPER, 1);   // what tools leave behind becomes a child of this process
    sigset_t all;
    sigfillset(&all);
    sigprocmask(SIG_SETMASK, &all, &m_toolMask);
    sigset_t childEnds;
    sigemptyset(&childEnds);
    sigaddset(&childEnds, SIGCHLD);
    m_childEnds = signalfd(-1, &childEnds, SFD_CLOEXEC | SFD_NONBLOCK);
  }

  void Serve() {
    for (;;) {
      pollfd events[] = {{m_socket, POLLIN, 0}, {m_childEnds, POLLIN, 0}};
      poll(events, 2, -1);
      if (events[1].revents != 0) {
        signalfd_siginfo ignored;
        while (read(m_childEnds, &ignored, sizeof ignored) > 0) {
        }
        if (Reap()) EndChildren(Which::Orphans);  // a compiler's driver was killed, and its assembler writes on
        SendReplies();
      }
      if (events[0].revents == 0) continue;
      uint32_t size;
      if (!ReceiveAll(m_socket, &size, sizeof size)) return EndChildren(Which::All);
      if (size == 0) return;
      std::string request(size, '\0');
      if (!ReceiveAll(m_socket, request.data(), size)) return EndChildren(Which::All);
      StartTool(request);
      SendReplies();
    }
  }

 private:
  enum class Which { Orphans, All };

  void StartTool(std::string& request) {
    const uint32_t number = m_nextRequest++;
    std::vector<char*> environment;
    for (size_t at = request.find('\0') + 1; at < request.size(); at = request.find('\0', at) + 1) {
      environment.push_back(&request[at]);
    }
    environment.push_back(nullptr);
    int failure[2];  // closed by the start of the tool, else gets the error
    if (pipe2(failure, O_CLOEXEC) != 0) return m_replies.push_back({number, errno, 0});
    const pid_t keeper = getpid();
    const pid_t process = fork();
    if (process == 0) Become(request.data(), environment.data(), keeper, failure[1]);
    int error = process < 0 ? errno : 0;
    close(failure[1]);
    if (process > 0 && read(failure[0], &error, sizeof error) == sizeof error) waitpid(process, nullptr, 0);
    close(failure[0]);
    if (error != 0) return m_replies.push_back({number, error, 0});
    m_tools[process] = number;
  }

  [[noreturn]] void Become(char* line, char** environment, pid_t keeper, int failure) {
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    if (getppid() != keeper || setpgid(0, m_toolGroup) != 0) _exit(127);  // the run is over
    sigprocmask(SIG_SETMASK, &m_toolMask, nullptr);
    char shell[] = "sh", option[] = "-c";
    char* const arguments[] = {shell, option, line, nullptr};
    execve("/bin/sh", arguments, environment);
    const int error = errno;
    [[maybe_unused]] const ssize_t told = write(failure, &error, sizeof error);
    _exit(127);
  }

  // Takes notice of the children that ended; whether a signal ended a tool.
  bool Reap() {
    bool wasKilled = false;
    int status;
    for (pid_t process; (process = waitpid(-1, &status, WNOHANG)) > 0;) {
      const auto tool = m_tools.find(process);
      if (tool == m_tools.end()) continue;
      m_replies.push_back({tool->second, 0, status});
      m_tools.erase(tool);
      wasKilled = wasKilled || CodeOf(status) > kEndedBySignal;
    }
    return wasKilled;
  }

  // Each has a second to take its temporary files away.
  void EndChildren(Which which) {
    constexpr int kMostPolite = 100;
    constexpr timespec kNap = {0, 10'000'000};
    std::set<pid_t> told;
    for (int round = 0;; ++round) {
      bool isAnyLeft = false;
      for (const pid_t child : Children()) {
        const bool isTool = m_tools.contains(child);
        if (isTool ? which == Which::Orphans : getsid(child) != getsid(0)) continue;
        isAnyLeft = true;
        if (round >= kMostPolite) {
          kill(child, SIGKILL);
        } else if (told.insert(child).second) {
          kill(child, SIGTERM);
          kill(child, SIGCONT);
        }
      }
      if (!isAnyLeft) return;
      nanosleep(&kNap, nullptr);
      Reap();
    }
  }

  void SendReplies() {
    for (const Reply& reply : m_replies) SendAll(m_socket, &reply, sizeof reply);
    m_replies.clear();
  }

  const int m_socket;
  const pid_t m_toolGroup;
  int m_childEnds = -1;
  sigset_t m_toolMask;
  uint32_t m_nextRequest = 0;
  std::map<pid_t, uint32_t> m_tools;  // that run, with the numbers of their requests
  std::vector<Reply> m_replies;       // not sent yet
};

// --- This process

volatile std::sig_atomic_t interruptedBy = 0;

// An interrupt is noted while a tool runs: the tool got it as well, and what it leaves has to be cleared away.
class InterruptWatch {
 public:
  InterruptWatch() {
    interruptedBy = 0;
    for (size_t i = 0; i < 2; ++i) {
      struct sigaction noted = {};
      noted.sa_handler = [](int signal) { interruptedBy = signal; };
      noted.sa_flags = SA_RESTART;
      sigaction(kSignals[i], nullptr, &m_before[i]);
      if (m_before[i].sa_handler != SIG_IGN) sigaction(kSignals[i], &noted, nullptr);
    }
  }
  ~InterruptWatch() {
    for (size_t i = 0; i < 2; ++i) sigaction(kSignals[i], &m_before[i], nullptr);
  }
  InterruptWatch(const InterruptWatch&) = delete;
  InterruptWatch& operator=(const InterruptWatch&) = delete;
  static int Signal() { return interruptedBy; }

 private:
  static constexpr int kSignals[] = {SIGINT, SIGQUIT};
  struct sigaction m_before[2];
};

}  // namespace

bool ToolKeeper::Start() {
  if (m_process > 0) return true;
  int sockets[2];
  if (socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, sockets) != 0) return false;
  const pid_t group = getpgrp();
  m_process = fork();
  if (m_process == 0) {
    close(sockets[0]);
    Keeper(sockets[1], group).Serve();
    _exit(0);
  }
  const int error = errno;
  close(sockets[1]);
  m_socket = sockets[0];
  if (m_process > 0) return true;
  close(m_socket);
  errno = error;
  return false;
}

int ToolKeeper::Ask(const std::string& shellLine) {
  std::string request = shellLine + '\0';
  for (char** entry = environ; *entry; ++entry) request.append(*entry).push_back('\0');
  const uint32_t size = static_cast<uint32_t>(request.size());
  Reply reply;
  if (!SendAll(m_socket, &size, sizeof size) || !SendAll(m_socket, request.data(), size) ||
      !ReceiveAll(m_socket, &reply, sizeof reply)) {
    Stop();  // it was killed, and the tool ended with it
    return kEndedBySignal + SIGKILL;
  }
  errno = reply.error;
  return reply.error != 0 ? -1 : CodeOf(reply.status);
}

int ToolKeeper::Run(const std::string& shellLine) {
  if (!Start()) return -1;
  const InterruptWatch watch;
  const int code = Ask(shellLine);
  return watch.Signal() != 0 ? kEndedBySignal + watch.Signal() : code;
}

void ToolKeeper::Stop() {
  if (m_process <= 0) return;
  const uint32_t goodbye = 0;
  SendAll(m_socket, &goodbye, sizeof goodbye);
  close(m_socket);
  while (waitpid(m_process, nullptr, 0) < 0 && errno == EINTR) {
  }
  m_process = m_socket = -1;
}

}  // namespace qrex::platform
