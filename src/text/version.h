// Which release this is: CMake's project() says so.
#pragma once

#include <string_view>

namespace qrex {

std::string_view Version();      // "2.20"
std::string_view ProductLine();  // what a run begins with, without a line end

}  // namespace qrex
