#include "platform/folder_lock.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <fstream>

namespace qrex::platform {

FolderLock::FolderLock(const std::string& folder)
    : m_handle(open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC)) {}

FolderLock::~FolderLock() {
  if (m_handle != kNoHandle) close(static_cast<int>(m_handle));
}

bool FolderLock::TryToTake() {
  return flock(static_cast<int>(m_handle), LOCK_EX | LOCK_NB) == 0 || errno != EWOULDBLOCK;
}

void FolderLock::Take() {
  while (flock(static_cast<int>(m_handle), LOCK_EX) != 0 && errno == EINTR) {
  }
}

// A line of the system's list: "1: FLOCK  ADVISORY  WRITE 1234 fe:00:5678 0 EOF", the folder as device and inode.
uint64_t FolderLock::Holder() const {
  struct stat status;
  if (fstat(static_cast<int>(m_handle), &status) != 0) return 0;
  std::ifstream locks("/proc/locks");
  for (std::string line; std::getline(locks, line);) {
    unsigned long long process, inode;
    unsigned deviceMajor, deviceMinor;
    if (std::sscanf(line.c_str(), "%*d: FLOCK %*s %*s %llu %x:%x:%llu", &process, &deviceMajor, &deviceMinor, &inode) ==
            4 &&
        inode == status.st_ino && deviceMajor == major(status.st_dev) && deviceMinor == minor(status.st_dev)) {
      return process;
    }
  }
  return 0;
}

}  // namespace qrex::platform
