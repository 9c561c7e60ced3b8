// Why something was made, in words.
#pragma once

#include <string>

#include "builder/build_observer.h"

namespace qrex {

std::string ReasonText(const MakeReason& why);

}  // namespace qrex
