// Typed values of the macro expressions: kinds, conversions with their two levels, operators, and their messages.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "text/exceptions.h"

namespace qrex {

enum class LiteralKind : int32_t { Undefined, Void, Bool, Int64, Float64, Char, String };
std::string_view LiteralKindName(LiteralKind kind);

struct Literal {
  LiteralKind kind = LiteralKind::Undefined;
  union {
    bool boolean;
    unsigned char character;
    int64_t integer = 0;
    double real;
  };
  std::string text;

  static Literal OfBool(bool value);
  static Literal OfChar(unsigned char value);
  static Literal OfInt(int64_t value);
  static Literal OfFloat(double value);
  static Literal OfString(std::string value);
};

// Each: true on success. On failure throws LiteralException when `throwOnFailure`, else false.
bool AsBool(const Literal& value, bool& out, bool isExplicit, bool throwOnFailure = true);
bool AsChar(const Literal& value, unsigned char& out, bool isExplicit, bool throwOnFailure = true);
bool AsFloat32(const Literal& value, float& out, bool isExplicit, bool throwOnFailure = true);
bool AsFloat64(const Literal& value, double& out, bool isExplicit, bool throwOnFailure = true);
bool AsInt8(const Literal& value, int8_t& out, bool isExplicit, bool throwOnFailure = true);
bool AsInt16(const Literal& value, int16_t& out, bool isExplicit, bool throwOnFailure = true);
bool AsInt32(const Literal& value, int32_t& out, bool isExplicit, bool throwOnFailure = true);
bool AsInt64(const Literal& value, int64_t& out, bool isExplicit, bool throwOnFailure = true);
bool AsUInt8(const Literal& value, uint8_t& out, bool isExplicit, bool throwOnFailure = true);
bool AsUInt16(const Literal& value, uint16_t& out, bool isExplicit, bool throwOnFailure = true);
bool AsUInt32(const Literal& value, uint32_t& out, bool isExplicit, bool throwOnFailure = true);
bool AsUInt64(const Literal& value, uint64_t& out, bool isExplicit, bool throwOnFailure = true);
bool AsString(const Literal& value, std::string& out, bool isExplicit, bool throwOnFailure = true);

// Operators by token kind (lex/token.h). All throw LiteralException.
Literal ApplyBinary(int32_t op, const Literal& left, const Literal& right);
Literal ApplyUnary(int32_t op, const Literal& value);
Literal ApplyIndex(const Literal& value, const Literal& index);
Literal ApplyLen(const Literal& value);
[[noreturn]] void FailAssign(const Literal& value);

}  // namespace qrex
