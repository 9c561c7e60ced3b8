#include "platform/standard_input.h"

#include <unistd.h>

#include <cerrno>

namespace qrex::platform {

bool ReadStdin(std::string& bytes) {
  constexpr size_t kChunk = 1 << 16;
  const size_t size = bytes.size();
  bytes.resize(size + kChunk);
  ssize_t count;
  do {
    count = read(STDIN_FILENO, bytes.data() + size, kChunk);
  } while (count < 0 && errno == EINTR);
  bytes.resize(size + static_cast<size_t>(count > 0 ? count : 0));
  return count > 0;
}

}  // namespace qrex::platform
