#include "text/version.h"

namespace qrex {

std::string_view Version() { return QREX_VERSION; }
std::string_view ProductLine() { return "Qrex V" QREX_VERSION " Oct  7 2020"; }

}  // namespace qrex
