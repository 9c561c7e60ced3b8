#include "platform/file_names.h"

namespace qrex::platform {

const bool kNamesFoldCase = false;
const bool kHasDrives = false;
std::string FoldCase(std::string_view path) { return std::string(path); }

}  // namespace qrex::platform
