#include "platform/posix/tool_keeper.h"

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
#include <cstring>
#include <ctime>
#include <functional>
#include <map>
#include <set>
#include <vector>

namespace qrex::platform {

namespace {

constexpr int kNotRun = 127;
constexpr int kEndedBySignal = 128;  // plus the signal, as the shell has it

// Ahead of each request. Behind it stand `size` bytes: the program, its words and its environment as strings that end
// in 0. The descriptors of the streams travel with it.
struct RequestHead {
  enum class Kind : uint32_t { RunTool, EndTools, Goodbye };
  Kind kind = Kind::RunTool;
  uint32_t number = 0;
  uint32_t size = 0;
  uint32_t words = 0;  // how many of the strings behind the first are words
  bool hasOutput = false, hasErrors = false, errorsIntoOutput = false;
};
constexpr size_t kMostStreams = 2;

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

// The ancillary data of a message: descriptors, of which the receiver gets its own.
struct StreamsInMessage {
  alignas(cmsghdr) char space[CMSG_SPACE(kMostStreams * sizeof(int))] = {};
};

bool SendHead(int socket, const RequestHead& head, const std::vector<int>& streams) {
  RequestHead copy = head;
  iovec data = {&copy, sizeof copy};
  StreamsInMessage control;
  msghdr message = {};
  message.msg_iov = &data;
  message.msg_iovlen = 1;
  if (!streams.empty()) {
    message.msg_control = control.space;
    message.msg_controllen = CMSG_SPACE(streams.size() * sizeof(int));
    cmsghdr* const header = CMSG_FIRSTHDR(&message);
    header->cmsg_level = SOL_SOCKET;
    header->cmsg_type = SCM_RIGHTS;
    header->cmsg_len = CMSG_LEN(streams.size() * sizeof(int));
    std::memcpy(CMSG_DATA(header), streams.data(), streams.size() * sizeof(int));
  }
  ssize_t sent;
  do {
    sent = sendmsg(socket, &message, MSG_NOSIGNAL);
  } while (sent < 0 && errno == EINTR);
  if (sent <= 0) return false;
  return SendAll(socket, reinterpret_cast<const char*>(&copy) + sent, sizeof copy - static_cast<size_t>(sent));
}

bool ReceiveHead(int socket, RequestHead& head, std::vector<Descriptor>& streams) {
  iovec data = {&head, sizeof head};
  StreamsInMessage control;
  msghdr message = {};
  message.msg_iov = &data;
  message.msg_iovlen = 1;
  message.msg_control = control.space;
  message.msg_controllen = sizeof control.space;
  ssize_t got;
  do {
    got = recvmsg(socket, &message, MSG_CMSG_CLOEXEC);
  } while (got < 0 && errno == EINTR);
  if (got <= 0) return false;
  for (cmsghdr* header = CMSG_FIRSTHDR(&message); header; header = CMSG_NXTHDR(&message, header)) {
    int numbers[kMostStreams];
    const size_t count = (header->cmsg_len - CMSG_LEN(0)) / sizeof(int);
    std::memcpy(numbers, CMSG_DATA(header), count * sizeof(int));
    for (size_t i = 0; i < count; ++i) streams.emplace_back(numbers[i]);
  }
  return ReceiveAll(socket, reinterpret_cast<char*>(&head) + got, sizeof head - static_cast<size_t>(got));
}

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

// Those that are meant, and what becomes a child as they end. Each has a second to take its temporary files away.
void EndChildren(const std::function<bool(pid_t)>& areMeant, const std::function<void(pid_t)>& reap) {
  constexpr int kMostPolite = 100;
  constexpr timespec kNap = {0, 10'000'000};
  std::set<pid_t> told;
  for (int round = 0;; ++round) {
    bool isAnyLeft = false;
    for (const pid_t child : Children()) {
      if (!areMeant(child)) continue;
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
    for (const pid_t child : told) reap(child);
  }
}

bool IsOfThisSession(pid_t process) { return getsid(process) == getsid(0); }  // no server that is to stay

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
        if (Reap()) End(Which::Orphans);  // a compiler's driver was killed, and its assembler writes on
        SendReplies();
      }
      if (events[0].revents == 0) continue;
      if (!Answer()) return;
      SendReplies();
    }
  }

 private:
  enum class Which { Orphans, All };

  // What is asked for next; false: nothing will be any more.
  bool Answer() {
    RequestHead head;
    std::vector<Descriptor> streams;
    const bool isAsked = ReceiveHead(m_socket, head, streams);
    if (isAsked && head.kind == RequestHead::Kind::RunTool) {
      std::string text(head.size, '\0');
      if (ReceiveAll(m_socket, text.data(), head.size)) {
        StartTool(head, text, streams);
        return true;
      }
    }
    if (!isAsked || head.kind != RequestHead::Kind::Goodbye || !m_tools.empty()) End(Which::All);
    return isAsked && head.kind == RequestHead::Kind::EndTools;
  }

  void StartTool(const RequestHead& head, std::string& text, const std::vector<Descriptor>& streams) {
    std::vector<char*> strings;  // the program, its words, null, its environment, null
    for (size_t at = 0; at < text.size(); at = text.find('\0', at) + 1) {
      if (strings.size() == 1 + head.words) strings.push_back(nullptr);
      strings.push_back(&text[at]);
    }
    if (strings.size() == 1 + head.words) strings.push_back(nullptr);
    strings.push_back(nullptr);
    const pid_t keeper = getpid();
    char** const own = environ;
    // The new process has the memory of this one until its program begins: a copy of the tables of pages would cost
    // more than the rest of the start.
    volatile int error = 0;
    const pid_t process = vfork();
    if (process == 0) {
      if (Prepare(head, streams, keeper)) {
        environ = &strings[head.words + 2];  // in whose PATH the program is looked for
        execvp(strings[0], &strings[1]);
        error = errno;
      }
      _exit(kNotRun);
    }
    if (process < 0) error = errno;
    environ = own;
    if (process > 0 && error != 0) waitpid(process, nullptr, 0);
    if (error != 0) return m_replies.push_back({head.number, error, 0});
    m_tools[process] = head.number;
  }

  // The new process ahead of its program. False: the run is over.
  bool Prepare(const RequestHead& head, const std::vector<Descriptor>& streams, pid_t keeper) const {
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    prctl(PR_SET_CHILD_SUBREAPER, 1);
    if (getppid() != keeper || setpgid(0, m_toolGroup) != 0) return false;
    sigprocmask(SIG_SETMASK, &m_toolMask, nullptr);
    dup2(open("/dev/null", O_RDONLY | O_CLOEXEC), STDIN_FILENO);
    auto stream = streams.begin();
    if (head.hasOutput) dup2((stream++)->Number(), STDOUT_FILENO);
    if (head.hasErrors) dup2((stream++)->Number(), STDERR_FILENO);
    if (head.errorsIntoOutput) dup2(STDOUT_FILENO, STDERR_FILENO);
    return true;
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
      // A shell that waited for its program tells its end so.
      wasKilled = wasKilled || WIFSIGNALED(status) || WEXITSTATUS(status) > kEndedBySignal;
    }
    return wasKilled;
  }

  void End(Which which) {
    EndChildren([&](pid_t child) { return m_tools.contains(child) ? which == Which::All : IsOfThisSession(child); },
                [this](pid_t) { Reap(); });
  }

  void SendReplies() {
    for (const ToolReply& reply : m_replies) SendAll(m_socket, &reply, sizeof reply);
    m_replies.clear();
  }

  const int m_socket;
  const pid_t m_toolGroup;
  int m_childEnds = -1;
  sigset_t m_toolMask;
  std::map<pid_t, uint32_t> m_tools;  // that run, with the numbers of their requests
  std::vector<ToolReply> m_replies;   // not sent yet
};

}  // namespace

// --- This process

std::unique_ptr<ToolKeeper> ToolKeeper::Start() {
  prctl(PR_SET_CHILD_SUBREAPER, 1);  // what a keeper leaves that is killed becomes a child of this process
  int sockets[2];
  if (socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, sockets) != 0) return nullptr;
  Descriptor ours(sockets[0]), theirs(sockets[1]);
  const pid_t group = getpgrp();
  const pid_t process = fork();
  if (process == 0) {
    ours.Close();
    Keeper(theirs.Number(), group).Serve();
    _exit(0);
  }
  const int error = errno;
  theirs.Close();
  if (process > 0) return std::unique_ptr<ToolKeeper>(new ToolKeeper(process, std::move(ours)));
  ours.Close();
  errno = error;
  return nullptr;
}

ToolKeeper::~ToolKeeper() {
  if (!m_isBroken) SendHead(Socket(), {.kind = RequestHead::Kind::Goodbye}, {});
  m_socket.Close();
  while (waitpid(m_process, nullptr, 0) < 0 && errno == EINTR) {
  }
}

void ToolKeeper::EndWhatIsLeft() {
  EndChildren(IsOfThisSession, [](pid_t child) { waitpid(child, nullptr, WNOHANG); });
}

bool ToolKeeper::Ask(const ToolRequest& request) {
  std::string text = request.program + '\0';
  for (const std::string& word : request.words) text.append(word).push_back('\0');
  for (char** entry = environ; *entry; ++entry) text.append(*entry).push_back('\0');
  std::vector<int> streams;
  for (const int stream : {request.output, request.errors}) {
    if (stream >= 0) streams.push_back(stream);
  }
  const RequestHead head = {.number = request.number,
                            .size = static_cast<uint32_t>(text.size()),
                            .words = static_cast<uint32_t>(request.words.size()),
                            .hasOutput = request.output >= 0,
                            .hasErrors = request.errors >= 0,
                            .errorsIntoOutput = request.errorsIntoOutput};
  m_isBroken = !SendHead(Socket(), head, streams) || !SendAll(Socket(), text.data(), text.size());
  return !m_isBroken;
}

bool ToolKeeper::EndTools() { return SendHead(Socket(), {.kind = RequestHead::Kind::EndTools}, {}); }

bool ToolKeeper::Receive(ToolReply& reply) { return ReceiveAll(Socket(), &reply, sizeof reply); }

}  // namespace qrex::platform
