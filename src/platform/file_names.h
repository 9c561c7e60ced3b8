// Which names are those of one file.
#pragma once

#include <string>
#include <string_view>

namespace qrex::platform {

extern const bool kNamesFoldCase;             // names that differ in case alone are those of one file
extern const bool kHasDrives;                 // a path may begin with the letter of a drive
std::string FoldCase(std::string_view path);  // the same for these

}  // namespace qrex::platform
