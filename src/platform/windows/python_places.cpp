#include "platform/python_places.h"

#include <algorithm>

#include "platform/file_system.h"

namespace qrex::platform {

std::string PythonLibraryName() { return "python27.dll"; }

// Where it was installed for all users, it lies in the system's folder, and Python knows the rest.
std::string PythonHomeOf(const std::string& library) {
  const std::string home = library.substr(0, std::min(library.rfind('/'), library.size()));
  return CanRead(home + "/Lib/os.py") ? home : std::string();
}

}  // namespace qrex::platform
