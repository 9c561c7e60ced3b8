#include "platform/peer_process.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>

namespace qrex::platform {

PeerProcess::PeerProcess(const std::vector<std::string>& words) {
  int ends[2];
  if (words.empty() || socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) != 0) return;
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_adddup2(&actions, ends[1], STDIN_FILENO);
  posix_spawn_file_actions_adddup2(&actions, ends[1], STDOUT_FILENO);
  posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, "/dev/null", O_WRONLY, 0);
  std::vector<char*> arguments;
  arguments.reserve(words.size() + 1);
  for (const std::string& word : words) arguments.push_back(const_cast<char*>(word.c_str()));
  arguments.push_back(nullptr);
  pid_t id = 0;
  const int failed = posix_spawnp(&id, arguments[0], &actions, nullptr, arguments.data(), environ);
  posix_spawn_file_actions_destroy(&actions);
  close(ends[1]);
  if (failed != 0) {
    close(ends[0]);
    return;
  }
  m_process = id;
  m_reads = m_writes = ends[0];
}

PeerProcess::~PeerProcess() {
  if (const auto id = static_cast<pid_t>(m_process); id != 0) {
    kill(id, SIGKILL);
    while (waitpid(id, nullptr, 0) < 0 && errno == EINTR) {
    }
  }
  if (m_reads != kNone) close(static_cast<int>(m_reads));
}

void PeerProcess::CloseStreams() {
  if (m_reads != kNone) shutdown(static_cast<int>(m_reads), SHUT_RDWR);
}

bool PeerProcess::Write(std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t sent = send(static_cast<int>(m_writes), bytes.data(), bytes.size(), MSG_NOSIGNAL);
    if (sent < 0 && errno == EINTR) continue;
    if (sent <= 0) return false;
    bytes.remove_prefix(static_cast<size_t>(sent));
  }
  return true;
}

bool PeerProcess::Read(std::string& bytes) {
  constexpr size_t kChunk = 1 << 16;
  const size_t size = bytes.size();
  bytes.resize(size + kChunk);
  ssize_t count;
  do {
    count = recv(static_cast<int>(m_reads), bytes.data() + size, kChunk, 0);
  } while (count < 0 && errno == EINTR);
  bytes.resize(size + static_cast<size_t>(count > 0 ? count : 0));
  return count > 0;
}

}  // namespace qrex::platform
