// What each byte can begin or continue. One look-up decides how a token is read; the plain ones (words, single
// characters) are read where they are met.
#pragma once

#include <array>
#include <cstdint>

namespace qrex {

enum ByteClass : uint8_t {
  kBadByte = 0,
  kBlankByte = 1,
  kLetterByte = 2,
  kDigitByte = 4,
  kQuoteByte = 8,
  kOperatorByte = 16,  // of one byte or more
  kSingleByte = 32,    // always a token of its own
};

constexpr std::array<uint8_t, 256> MakeByteClasses() {
  std::array<uint8_t, 256> classes{};
  auto set = [&](const char* bytes, ByteClass byteClass) {
    for (; *bytes; ++bytes) classes[static_cast<unsigned char>(*bytes)] = byteClass;
  };
  set(" \t\n\v\f\r", kBlankByte);
  set("abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ_", kLetterByte);
  set("0123456789", kDigitByte);
  set("\"'", kQuoteByte);
  set("+<>&|^-*/%!=?:$@", kOperatorByte);
  set("#.,;(){}[]~\\`", kSingleByte);
  return classes;
}
inline constexpr std::array<uint8_t, 256> kByteClasses = MakeByteClasses();

inline uint8_t ByteClassOf(char c) { return kByteClasses[static_cast<unsigned char>(c)]; }
inline bool IsBlankByte(char c) { return ByteClassOf(c) == kBlankByte; }
inline bool IsIdentifierStart(char c) { return ByteClassOf(c) == kLetterByte; }
inline bool IsIdentifierPart(char c) { return (ByteClassOf(c) & (kLetterByte | kDigitByte)) != 0; }

}  // namespace qrex
