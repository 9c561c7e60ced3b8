#include "platform/job_server.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <charconv>
#include <string>

#include "platform/posix/descriptor.h"

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

class Pipe : public TokenPool {
 public:
  Pipe(Descriptor read, Descriptor write) : m_read(std::move(read)), m_write(std::move(write)) {}
  bool TryTake(char& token) override { return read(m_read.Number(), &token, 1) == 1; }
  void Give(char token) override {
    while (write(m_write.Number(), &token, 1) < 0 && errno == EINTR) {
    }
  }

 private:
  Descriptor m_read, m_write;
};

}  // namespace

std::unique_ptr<TokenPool> TokenPool::Open(std::string_view name) {
  constexpr std::string_view kFifo = "fifo:";
  Descriptor read, write;
  if (name.starts_with(kFifo)) {
    const std::string path(name.substr(kFifo.size()));
    read = Reopened(path, O_RDWR | O_NONBLOCK);
    write = Reopened(path, O_RDWR);
  } else {
    int from = -1, to = -1;
    if (!ReadNumber(name, from) || !name.starts_with(',')) return nullptr;
    name.remove_prefix(1);
    if (!ReadNumber(name, to) || !IsPipe(from) || !IsPipe(to)) return nullptr;
    const std::string folder = "/proc/self/fd/";
    read = Reopened(folder + std::to_string(from), O_RDONLY | O_NONBLOCK);
    write = Reopened(folder + std::to_string(to), O_WRONLY);
  }
  if (!read.IsOpen() || !write.IsOpen() || !IsPipe(read.Number())) return nullptr;
  return std::make_unique<Pipe>(std::move(read), std::move(write));
}

}  // namespace qrex::platform
