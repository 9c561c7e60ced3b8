#include "platform/file_claim.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

namespace qrex::platform {

FileClaim::~FileClaim() {
  if (m_handle != kNoHandle) close(static_cast<int>(m_handle));
}

// Between the two calls a sweep may have locked and removed it.
Result FileClaim::Make(const std::string& path) {
  const int descriptor = open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
  if (descriptor < 0) return Result::OfCall(false);
  const bool isTaken = flock(descriptor, LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK;
  struct stat status;
  if (!isTaken && (fstat(descriptor, &status) != 0 || status.st_nlink > 0)) {
    m_handle = descriptor;
    return {};
  }
  close(descriptor);
  return Result::Failure(kErrorFileExists);
}

void FileClaim::RemoveAbandoned(const std::string& path) {
  const int descriptor = open(path.c_str(), O_RDONLY | O_NONBLOCK | O_NOFOLLOW | O_CLOEXEC);
  if (descriptor < 0) return;
  if (flock(descriptor, LOCK_EX | LOCK_NB) == 0) unlink(path.c_str());
  close(descriptor);
}

}  // namespace qrex::platform
