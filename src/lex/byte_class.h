// What each byte can begin or continue, in each dialect. One look-up decides how a token is read; the plain ones
// (words, single characters) are read where they are met.
#pragma once

#include <array>
#include <cstdint>

namespace qrex {

// How a text is scanned. It is part of a scanner's value and goes where its copies go.
enum class Dialect : uint8_t {
  Qrex,  // every language of the system
  Cpp,   // translated C and C++ under `modernCpp`: the tokens of C++20
};

enum ByteClass : uint8_t {
  kBadByte = 0,
  kBlankByte = 1,
  kLetterByte = 2,
  kDigitByte = 4,
  kQuoteByte = 8,
  kOperatorByte = 16,  // of one byte or more
  kSingleByte = 32,    // always a token of its own
  kPrefixByte = 64,    // a letter that may begin a quoted string
  kDotByte = 128,      // where it may begin a number
};

using ByteClasses = std::array<uint8_t, 256>;

constexpr ByteClasses MakeByteClasses(Dialect dialect) {
  ByteClasses classes{};
  auto set = [&](const char* bytes, ByteClass byteClass) {
    for (; *bytes; ++bytes) classes[static_cast<unsigned char>(*bytes)] = byteClass;
  };
  set(" \t\n\v\f\r", kBlankByte);
  set("abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ_", kLetterByte);
  set("0123456789", kDigitByte);
  set("\"'", kQuoteByte);
  set("+<>&|^-*/%!=?:$@", kOperatorByte);
  set("#.,;(){}[]~\\`", kSingleByte);
  set("rR", kPrefixByte);
  if (dialect == Dialect::Cpp) {
    set("r", kLetterByte);
    set("LuUR", kPrefixByte);
    set(".", kDotByte);
    for (size_t byte = 0x80; byte < 256; ++byte) classes[byte] = kLetterByte;  // UTF-8
  }
  return classes;
}
inline constexpr ByteClasses kByteClasses[] = {MakeByteClasses(Dialect::Qrex), MakeByteClasses(Dialect::Cpp)};

inline const ByteClasses& ByteClassesOf(Dialect dialect) { return kByteClasses[static_cast<size_t>(dialect)]; }
inline uint8_t ByteClassOf(char c, const ByteClasses& classes = kByteClasses[0]) {
  return classes[static_cast<unsigned char>(c)];
}
inline bool IsBlankByte(char c) { return ByteClassOf(c) == kBlankByte; }
inline bool IsIdentifierStart(char c) { return (ByteClassOf(c) & (kLetterByte | kPrefixByte)) != 0; }
inline bool IsIdentifierPart(char c, const ByteClasses& classes = kByteClasses[0]) {
  return (ByteClassOf(c, classes) & (kLetterByte | kPrefixByte | kDigitByte)) != 0;
}

}  // namespace qrex
