// 16-byte identifiers in the Windows byte layout: the first three fields little-endian.
#pragma once

#include <array>
#include <compare>
#include <cstdint>
#include <string>
#include <string_view>

namespace qrex {

struct guid {
  std::array<uint8_t, 16> bytes{};
  friend bool operator==(const guid&, const guid&) = default;
  std::strong_ordering operator<=>(const guid& other) const;  // by the two 64-bit halves, first half first
};

guid MakeGuid();
std::string GuidText(const guid& id);             // "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}", upper case
bool ParseGuid(std::string_view text, guid& id);  // the same form, either case

}  // namespace qrex
