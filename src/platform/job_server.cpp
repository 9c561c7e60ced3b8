#include "platform/job_server.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <charconv>
#include <string_view>

#include "platform/system.h"

namespace qrex::platform {

namespace {

// make hands the numbers to each program that it starts, but not always what they stand for.
bool IsPipe(int number) {
  struct stat info;
  return fstat(number, &info) == 0 && S_ISFIFO(info.st_mode);
}

// Anew, so that it can be read without waiting: how make and its other programs see the pipe does not change.
Descriptor Reopened(const std::string& path, int flags) { return Descriptor(open(path.c_str(), flags | O_CLOEXEC)); }

bool ReadNumber(std::string_view& text, int& number) {
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  text.remove_prefix(static_cast<size_t>(end - text.data()));
  return error == std::errc() && number >= 0;
}

// The last of the options counts: a make within a make adds its own.
std::string OptionOf(const std::string& flags) {
  std::string found;
  for (const std::string_view option : {"--jobserver-fds=", "--jobserver-auth="}) {
    const size_t at = flags.rfind(option);
    if (at == std::string::npos) continue;
    const size_t begin = at + option.size();
    found = flags.substr(begin, flags.find(' ', begin) - begin);
  }
  return found;
}

}  // namespace

std::unique_ptr<JobServer> JobServer::FromEnvironment() {
  constexpr std::string_view kFifo = "fifo:";
  const std::string option = OptionOf(EnvironmentValue("MAKEFLAGS").value_or(""));
  std::string_view rest = option;
  Descriptor read, write;
  if (rest.starts_with(kFifo)) {
    const std::string path(rest.substr(kFifo.size()));
    read = Reopened(path, O_RDWR | O_NONBLOCK);
    write = Reopened(path, O_RDWR);
  } else {
    int from = -1, to = -1;
    if (!ReadNumber(rest, from) || !rest.starts_with(',')) return nullptr;
    rest.remove_prefix(1);
    if (!ReadNumber(rest, to) || !IsPipe(from) || !IsPipe(to)) return nullptr;
    const std::string folder = "/proc/self/fd/";
    read = Reopened(folder + std::to_string(from), O_RDONLY | O_NONBLOCK);
    write = Reopened(folder + std::to_string(to), O_WRONLY);
  }
  if (!read.IsOpen() || !write.IsOpen() || !IsPipe(read.Number())) return nullptr;
  return std::unique_ptr<JobServer>(new JobServer(std::move(read), std::move(write)));
}

bool JobServer::TryTakeToken() {
  char token;
  if (read(m_read.Number(), &token, 1) != 1) return false;
  m_tokens.push_back(token);
  return true;
}

void JobServer::KeepTokens(size_t count) {
  while (m_tokens.size() > count) {
    const char token = m_tokens.back();
    m_tokens.pop_back();
    while (write(m_write.Number(), &token, 1) < 0 && errno == EINTR) {
    }
  }
}

}  // namespace qrex::platform
