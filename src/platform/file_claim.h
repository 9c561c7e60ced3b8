// A new file that its maker holds by a lock. Whoever finds it can tell whether the maker lives, also where the two see
// each other's processes under other numbers or not at all, as in containers that share a folder.
#pragma once

#include <cstdint>
#include <string>

#include "platform/error.h"

namespace qrex::platform {

class FileClaim {
 public:
  FileClaim() = default;
  ~FileClaim();
  FileClaim(const FileClaim&) = delete;
  FileClaim& operator=(const FileClaim&) = delete;

  // Makes the file, which must not be there, and holds it to the end of this object. kErrorFileExists: another name
  // has to be tried.
  Result Make(const std::string& path);
  // Removes a file that nobody holds. Where the file system has no locks, none.
  static void RemoveAbandoned(const std::string& path);

 private:
  intptr_t m_handle = kNoHandle;
};

}  // namespace qrex::platform
