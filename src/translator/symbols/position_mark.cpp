#include "translator/symbols/position_mark.h"

#include <charconv>
#include <cstdint>

namespace qrex {

std::string PositionMark(const char* source) {
  char digits[kMarkDigits];
  const auto end = std::to_chars(digits, digits + kMarkDigits, reinterpret_cast<uintptr_t>(source), 16).ptr;
  const auto count = static_cast<size_t>(end - digits);
  return kPositionMark + std::string(kMarkDigits - count, '0') + std::string(digits, count);
}

const char* MarkedPosition(std::string_view digits) {
  uintptr_t address = 0;
  const auto read = std::from_chars(digits.data(), digits.data() + digits.size(), address, 16);
  const bool isMark = read.ptr == digits.data() + digits.size();
  return isMark ? reinterpret_cast<const char*>(address) : nullptr;  // NOLINT(performance-no-int-to-ptr): was a pointer
}

}  // namespace qrex
