// A lock of a folder among the processes of this machine. Nothing is written into the folder, and the system releases
// the lock when its holder ends, however it ends.
#pragma once

#include <cstdint>
#include <string>

#include "platform/error.h"

namespace qrex::platform {

class FolderLock {
 public:
  explicit FolderLock(const std::string& folder);
  ~FolderLock();
  FolderLock(const FolderLock&) = delete;
  FolderLock& operator=(const FolderLock&) = delete;

  // False when another process holds it. A file system without locks has no others: true.
  bool TryToTake();
  void Take();              // waits
  uint64_t Holder() const;  // the process that holds it; 0 where the system does not tell

 private:
  const intptr_t m_handle;
};

}  // namespace qrex::platform
