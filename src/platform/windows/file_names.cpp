#include "platform/file_names.h"

#include "platform/windows/api.h"

namespace qrex::platform {

const bool kNamesFoldCase = true;
const bool kHasDrives = true;

// As file systems do it, in upper case, whatever language the user has.
std::string FoldCase(std::string_view path) {
  std::wstring wide = Wide(path);
  const int size = static_cast<int>(wide.size());
  LCMapStringW(LOCALE_INVARIANT, LCMAP_UPPERCASE, wide.data(), size, wide.data(), size);
  return Narrow(wide);
}

}  // namespace qrex::platform
