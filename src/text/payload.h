// The payloads of checked files (text/files.h) that the build keeps: numbers are little-endian, strings a compact
// length and their bytes.
#pragma once

#include <bit>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

#include "text/exceptions.h"
#include "text/numbers.h"

namespace qrex {

inline void AppendNumber(std::string& out, uint64_t value, size_t bytes) {
  for (size_t i = 0; i < bytes; ++i) out += static_cast<char>(value >> (8 * i));
}

// Reads piece by piece; whatever does not fit raises DeserialisationException.
class PayloadReader {
 public:
  explicit PayloadReader(std::string_view payload) : m_rest(payload) {}

  uint64_t Number(size_t bytes) {
    if (m_rest.size() < bytes) throw DeserialisationException();
    uint64_t value = 0;
    if constexpr (std::endian::native == std::endian::little) {
      std::memcpy(&value, m_rest.data(), bytes);
    } else {
      for (size_t i = bytes; i-- > 0;) value = value << 8 | static_cast<unsigned char>(m_rest[i]);
    }
    m_rest.remove_prefix(bytes);
    return value;
  }
  uint64_t Length() {
    uint64_t length;
    if (!ReadCompactLength(m_rest, length)) throw DeserialisationException();
    return length;
  }
  std::string_view String() {  // lies in the payload
    std::string_view text;
    if (!ReadCompactString(m_rest, text)) throw DeserialisationException();
    return text;
  }

 private:
  std::string_view m_rest;
};

}  // namespace qrex
