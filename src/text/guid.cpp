#include "text/guid.h"

#include <cstring>

#include "platform/system.h"

namespace qrex {

namespace {

// Where byte i of the text form is in memory: the first three fields are little-endian.
constexpr size_t kTextOrder[16] = {3, 2, 1, 0, 5, 4, 7, 6, 8, 9, 10, 11, 12, 13, 14, 15};
constexpr std::string_view kShape = "{########-####-####-####-############}";

int HexDigit(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}

uint64_t Half(const guid& id, size_t at) {
  uint64_t value = 0;
  for (size_t i = 8; i-- > 0;) value = value << 8 | id.bytes[at + i];
  return value;
}

}  // namespace

std::strong_ordering guid::operator<=>(const guid& other) const {
  const auto first = Half(*this, 0) <=> Half(other, 0);
  return first != std::strong_ordering::equal ? first : Half(*this, 8) <=> Half(other, 8);
}

guid MakeGuid() {
  const std::array<uint8_t, 16> made = platform::MakeUuid();
  guid id;
  for (size_t i = 0; i < 16; ++i) id.bytes[kTextOrder[i]] = made[i];
  return id;
}

std::string GuidText(const guid& id) {
  static constexpr char kDigits[] = "0123456789ABCDEF";
  std::string text(kShape);
  size_t digit = 0;
  for (char& c : text) {
    if (c != '#') continue;
    const uint8_t byte = id.bytes[kTextOrder[digit / 2]];
    c = kDigits[digit % 2 == 0 ? byte >> 4 : byte & 15];
    ++digit;
  }
  return text;
}

bool ParseGuid(std::string_view text, guid& id) {
  if (text.size() != kShape.size()) return false;
  guid parsed;
  size_t digit = 0;
  for (size_t i = 0; i < text.size(); ++i) {
    if (kShape[i] != '#') {
      if (text[i] != kShape[i]) return false;
      continue;
    }
    const int value = HexDigit(text[i]);
    if (value < 0) return false;
    uint8_t& byte = parsed.bytes[kTextOrder[digit++ / 2]];
    byte = static_cast<uint8_t>(byte << 4 | value);
  }
  id = parsed;
  return true;
}

}  // namespace qrex
