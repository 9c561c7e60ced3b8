// What `Qrex --help` prints.
#pragma once

#include <string>

namespace qrex {

std::string HelpText();

}  // namespace qrex
