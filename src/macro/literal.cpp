#include "macro/literal.h"

#include <cmath>
#include <limits>

#include "lex/token.h"
#include "platform/arithmetic.h"
#include "text/numbers.h"

namespace qrex {

namespace {

using Kind = LiteralKind;

[[noreturn]] void Fail(std::string message) { throw LiteralException(std::move(message)); }

std::string Name(const Literal& value) { return std::string(LiteralKindName(value.kind)); }

// The outcome of a conversion that the tables refuse.
bool Refuse(const Literal& value, std::string_view target, bool implicitOnly, bool throwOnFailure) {
  if (!throwOnFailure) return false;
  if (value.kind == Kind::Undefined) Fail("Expected " + std::string(target));
  Fail((implicitOnly ? "No implicit conversion from " : "No conversion from ") + Name(value) + " to " +
       std::string(target));
}

bool RefuseValue(const std::string& text, std::string_view target, bool throwOnFailure) {
  if (throwOnFailure) Fail("No implicit conversion from value " + text + " to " + std::string(target));
  return false;
}

int64_t Truncated(double value) {
  if (std::isnan(value)) return 0;
  if (value >= 9223372036854775808.0) return std::numeric_limits<int64_t>::max();
  if (value <= -9223372036854775808.0) return std::numeric_limits<int64_t>::min();
  return static_cast<int64_t>(value);
}

}  // namespace

std::string_view LiteralKindName(LiteralKind kind) {
  static constexpr std::string_view kNames[] = {"undef", "void", "bool", "int64", "float64", "char", "string"};
  return kNames[static_cast<size_t>(kind)];
}

Literal Literal::OfBool(bool value) {
  Literal literal;
  literal.kind = Kind::Bool;
  literal.boolean = value;
  return literal;
}

Literal Literal::OfChar(unsigned char value) {
  Literal literal;
  literal.kind = Kind::Char;
  literal.character = value;
  return literal;
}

Literal Literal::OfInt(int64_t value) {
  Literal literal;
  literal.kind = Kind::Int64;
  literal.integer = value;
  return literal;
}

Literal Literal::OfFloat(double value) {
  Literal literal;
  literal.kind = Kind::Float64;
  literal.real = value;
  return literal;
}

Literal Literal::OfString(std::string value) {
  Literal literal;
  literal.kind = Kind::String;
  literal.text = std::move(value);
  return literal;
}

// --- Conversions

bool AsBool(const Literal& value, bool& out, bool isExplicit, bool throwOnFailure) {
  switch (value.kind) {
    case Kind::Bool:
      out = value.boolean;
      return true;
    case Kind::Int64:
      if (!isExplicit) return Refuse(value, "bool", true, throwOnFailure);
      out = value.integer != 0;
      return true;
    case Kind::Float64:
      if (!isExplicit) return Refuse(value, "bool", true, throwOnFailure);
      out = value.real != 0;
      return true;
    default:
      return Refuse(value, "bool", false, throwOnFailure);
  }
}

bool AsChar(const Literal& value, unsigned char& out, bool isExplicit, bool throwOnFailure) {
  switch (value.kind) {
    case Kind::Char:
      out = value.character;
      return true;
    case Kind::Int64:
      if (!isExplicit && (value.integer < 0 || value.integer > 255)) {
        return RefuseValue(ToString(value.integer), "char", throwOnFailure);
      }
      out = static_cast<unsigned char>(value.integer);
      return true;
    case Kind::String:
      if (!isExplicit || value.text.size() != 1) return RefuseValue(value.text, "char", throwOnFailure);
      out = static_cast<unsigned char>(value.text.front());
      return true;
    default:
      return Refuse(value, "char", false, throwOnFailure);
  }
}

namespace {

bool AsFloat(const Literal& value, double& out, bool isExplicit, bool throwOnFailure, std::string_view target) {
  switch (value.kind) {
    case Kind::Float64:
      out = value.real;
      return true;
    case Kind::Int64:
      out = static_cast<double>(value.integer);
      return true;
    case Kind::Bool:
      if (!isExplicit) return Refuse(value, target, true, throwOnFailure);
      out = value.boolean ? 1.0 : 0.0;
      return true;
    default:
      return Refuse(value, target, false, throwOnFailure);
  }
}

template <typename T>
bool AsNarrow(const Literal& value, T& out, bool isExplicit, bool throwOnFailure, std::string_view target) {
  int64_t wide = 0;
  if (!AsInt64(value, wide, isExplicit, throwOnFailure)) return false;
  if (!isExplicit && (wide < static_cast<int64_t>(std::numeric_limits<T>::min()) ||
                      wide > static_cast<int64_t>(std::numeric_limits<T>::max()))) {
    return RefuseValue(ToString(wide), target, throwOnFailure);
  }
  out = static_cast<T>(wide);
  return true;
}

}  // namespace

bool AsFloat64(const Literal& value, double& out, bool isExplicit, bool throwOnFailure) {
  return AsFloat(value, out, isExplicit, throwOnFailure, "float64");
}

bool AsFloat32(const Literal& value, float& out, bool isExplicit, bool throwOnFailure) {
  double wide = 0;
  if (!AsFloat(value, wide, isExplicit, throwOnFailure, "float32")) return false;
  out = static_cast<float>(wide);
  return true;
}

bool AsInt64(const Literal& value, int64_t& out, bool isExplicit, bool throwOnFailure) {
  if (value.kind == Kind::Int64) {
    out = value.integer;
    return true;
  }
  const bool isConvertible = value.kind == Kind::Bool || value.kind == Kind::Float64 || value.kind == Kind::Char;
  if (!isConvertible) return Refuse(value, "int64", false, throwOnFailure);
  if (!isExplicit) return Refuse(value, "int64", true, throwOnFailure);
  out = value.kind == Kind::Bool ? value.boolean : value.kind == Kind::Char ? value.character : Truncated(value.real);
  return true;
}

bool AsInt8(const Literal& value, int8_t& out, bool isExplicit, bool throwOnFailure) {
  return AsNarrow(value, out, isExplicit, throwOnFailure, "int8");
}
bool AsInt16(const Literal& value, int16_t& out, bool isExplicit, bool throwOnFailure) {
  return AsNarrow(value, out, isExplicit, throwOnFailure, "int16");
}
bool AsInt32(const Literal& value, int32_t& out, bool isExplicit, bool throwOnFailure) {
  return AsNarrow(value, out, isExplicit, throwOnFailure, "int32");
}
bool AsUInt8(const Literal& value, uint8_t& out, bool isExplicit, bool throwOnFailure) {
  return AsNarrow(value, out, isExplicit, throwOnFailure, "uint8");
}
bool AsUInt16(const Literal& value, uint16_t& out, bool isExplicit, bool throwOnFailure) {
  return AsNarrow(value, out, isExplicit, throwOnFailure, "uint16");
}
bool AsUInt32(const Literal& value, uint32_t& out, bool isExplicit, bool throwOnFailure) {
  return AsNarrow(value, out, isExplicit, throwOnFailure, "uint32");
}
bool AsUInt64(const Literal& value, uint64_t& out, bool isExplicit, bool throwOnFailure) {
  int64_t wide = 0;
  if (!AsInt64(value, wide, isExplicit, throwOnFailure)) return false;
  out = static_cast<uint64_t>(wide);
  return true;
}

bool AsString(const Literal& value, std::string& out, bool isExplicit, bool throwOnFailure) {
  switch (value.kind) {
    case Kind::String:
      out = value.text;
      return true;
    case Kind::Char:
      out.assign(1, static_cast<char>(value.character));
      return true;
    case Kind::Bool:
    case Kind::Int64:
    case Kind::Float64:
      if (!isExplicit) return Refuse(value, "string", true, throwOnFailure);
      if (value.kind == Kind::Bool)
        out = value.boolean ? "true" : "false";
      else
        out = value.kind == Kind::Int64 ? ToString(value.integer) : ToString(value.real);
      return true;
    default:
      return Refuse(value, "string", false, throwOnFailure);
  }
}

// --- Operators. Each rule is tried in turn: what both operands convert to without `explicit`.

namespace {

bool BothInt(const Literal& a, const Literal& b) { return a.kind == Kind::Int64 && b.kind == Kind::Int64; }

bool BothFloat(const Literal& a, const Literal& b, double& x, double& y) {
  return AsFloat64(a, x, false, false) && AsFloat64(b, y, false, false);
}

bool BothString(const Literal& a, const Literal& b, std::string& x, std::string& y) {
  return AsString(a, x, false, false) && AsString(b, y, false, false);
}

bool BothBool(const Literal& a, const Literal& b) { return a.kind == Kind::Bool && b.kind == Kind::Bool; }

bool BothChar(const Literal& a, const Literal& b, unsigned char& x, unsigned char& y) {
  return AsChar(a, x, false, false) && AsChar(b, y, false, false);
}

std::string_view OperatorText(int32_t op) {
  switch (op) {
    case kPlus:
      return "+";
    case kMinus:
      return "-";
    case kStar:
      return "*";
    case kSlash:
      return "/";
    case kPercent:
      return "%";
    case kAnd:
      return "&";
    case kOr:
      return "|";
    case kXor:
      return "^";
    case kShiftLeft:
      return "<<";
    case kShiftRight:
      return ">>";
    case kXorXor:
      return "^";
    case kTilde:
      return "~";
    case kNot:
      return "!";
    default:
      return "comparison";
  }
}

[[noreturn]] void FailTypes(int32_t op, const Literal& a, const Literal& b) {
  Fail("Incompatible types (" + Name(a) + " and " + Name(b) + ") for " + std::string(OperatorText(op)) + " operation");
}

// All in two's complement that wraps.
int64_t ApplyInt(int32_t op, int64_t a, int64_t b) {
  const uint64_t x = static_cast<uint64_t>(a), y = static_cast<uint64_t>(b);
  switch (op) {
    case kPlus:
      return static_cast<int64_t>(x + y);
    case kMinus:
      return static_cast<int64_t>(x - y);
    case kStar:
      return static_cast<int64_t>(x * y);
    case kSlash:
      if (b == 0) Fail("Division by zero error");
      return b == -1 ? static_cast<int64_t>(0 - x) : a / b;
    case kPercent:
      if (b == 0) Fail("Modulo zero error");
      return b == -1 ? 0 : a % b;
    case kAnd:
      return a & b;
    case kOr:
      return a | b;
    case kXor:
      return a ^ b;
    case kShiftLeft:
      return static_cast<int64_t>(x << (y % 64));
    default:
      return a >> (y % 64);
  }
}

bool HasFloatRule(int32_t op) { return op == kPlus || op == kMinus || op == kStar || op == kSlash; }

double ApplyFloat(int32_t op, double a, double b) {
  switch (op) {
    case kPlus:
      return a + b;
    case kMinus:
      return a - b;
    case kStar:
      return a * b;
    default:
      if (b == 0) Fail("Division by zero");
      return a / b;
  }
}

Literal ApplyPower(const Literal& left, const Literal& right) {
  double base = 0, exponent = 0;
  if (!BothFloat(left, right, base, exponent)) FailTypes(kXorXor, left, right);
  if (base == 0 && exponent < 0) {
    MemoryTextWriter text;
    text << "Calculation " << base << " ^^ " << exponent << " ill defined";
    Fail(text.TakeText());
  }
  const double power = platform::Power(base, exponent);
  return BothInt(left, right) ? Literal::OfInt(Truncated(power)) : Literal::OfFloat(power);
}

bool AreEqual(const Literal& left, const Literal& right) {
  unsigned char c = 0, d = 0;
  double x = 0, y = 0;
  std::string s, t;
  if (BothBool(left, right)) return left.boolean == right.boolean;
  if (BothChar(left, right, c, d)) return c == d;
  if (BothString(left, right, s, t)) return s == t;
  if (BothInt(left, right)) return left.integer == right.integer;
  if (BothFloat(left, right, x, y)) return x == y;
  FailTypes(kEqual, left, right);
}

bool IsLess(const Literal& left, const Literal& right, bool orEqual) {
  double x = 0, y = 0;
  std::string s, t;
  if (BothString(left, right, s, t)) return orEqual ? s <= t : s < t;
  if (BothInt(left, right)) return orEqual ? left.integer <= right.integer : left.integer < right.integer;
  if (BothFloat(left, right, x, y)) return orEqual ? x <= y : x < y;
  FailTypes(kLess, left, right);
}

Literal ApplyLogical(int32_t op, const Literal& left, const Literal& right) {
  bool value = false;
  AsBool(left, value, false);
  if (value == (op == kAndAnd)) AsBool(right, value, false);
  return Literal::OfBool(value);
}

}  // namespace

Literal ApplyBinary(int32_t op, const Literal& left, const Literal& right) {
  switch (op) {
    case kAndAnd:
    case kOrOr:
      return ApplyLogical(op, left, right);
    case kXorXor:
      return ApplyPower(left, right);
    case kEqual:
      return Literal::OfBool(AreEqual(left, right));
    case kNotEqual:
      return Literal::OfBool(!AreEqual(left, right));
    case kLess:
      return Literal::OfBool(IsLess(left, right, false));
    case kLessEqual:
      return Literal::OfBool(IsLess(left, right, true));
    case kGreater:
      return Literal::OfBool(IsLess(right, left, false));
    case kGreaterEqual:
      return Literal::OfBool(IsLess(right, left, true));
    default:
      break;
  }
  std::string s, t;
  double x = 0, y = 0;
  if (op == kPlus && BothString(left, right, s, t)) return Literal::OfString(s + t);
  if (BothInt(left, right)) return Literal::OfInt(ApplyInt(op, left.integer, right.integer));
  if (HasFloatRule(op) && BothFloat(left, right, x, y)) return Literal::OfFloat(ApplyFloat(op, x, y));
  FailTypes(op, left, right);
}

Literal ApplyUnary(int32_t op, const Literal& value) {
  if (op == kNot) {
    bool boolean = false;
    AsBool(value, boolean, false);
    return Literal::OfBool(!boolean);
  }
  if (value.kind == Kind::Int64) {
    if (op == kTilde) return Literal::OfInt(~value.integer);
    return op == kPlus ? value : Literal::OfInt(ApplyInt(kMinus, 0, value.integer));
  }
  if (value.kind == Kind::Float64 && op != kTilde) return Literal::OfFloat(op == kPlus ? value.real : -value.real);
  Fail("Incompatible type (" + Name(value) + ") for unary " + std::string(OperatorText(op)) + " operation");
}

Literal ApplyIndex(const Literal& value, const Literal& index) {
  if (value.kind != Kind::String) Fail("[] not available on " + Name(value));
  int32_t at = 0;
  AsInt32(index, at, false);
  if (at < 0 || static_cast<size_t>(at) >= value.text.size()) {
    Fail("Index " + std::to_string(at) + " out of range [0," + std::to_string(value.text.size()) + ") on string");
  }
  return Literal::OfChar(static_cast<unsigned char>(value.text[static_cast<size_t>(at)]));
}

Literal ApplyLen(const Literal& value) {
  if (value.kind != Kind::String) Fail("len() not available on " + Name(value));
  return Literal::OfInt(static_cast<int64_t>(value.text.size()));
}

void FailAssign(const Literal& value) {
  const bool isValue = value.kind != Kind::Undefined && value.kind != Kind::Void;
  Fail("Can't assign to " + Name(value) + (isValue ? " r-value" : ""));
}

}  // namespace qrex
