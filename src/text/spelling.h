// Which word may have been meant.
#pragma once

#include <string_view>

namespace qrex {

// Whether the words have the same letters but for one, or in another order.
bool IsAlmost(std::string_view word, std::string_view other);

}  // namespace qrex
