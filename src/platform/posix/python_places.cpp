#include "platform/python_places.h"

#include <algorithm>

#include "platform/file_system.h"

namespace qrex::platform {

std::string PythonLibraryName() { return "libpython2.7.so.1.0"; }

std::string PythonHomeOf(const std::string& library) {
  std::string home = library;
  for (int i = 0; i < 2; ++i) home.erase(std::min(home.rfind('/'), home.size()));
  return !home.empty() && CanRead(home + "/lib/python2.7/os.py") ? home : std::string();
}

}  // namespace qrex::platform
