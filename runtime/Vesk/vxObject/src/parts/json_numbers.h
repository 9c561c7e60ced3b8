// Numbers, bools, characters and labels in JSON.

@import "Vesk/vxObject/src/json_scalars.h"

#include <charconv>
#include <limits>
#ifndef __cpp_lib_to_chars
#include <locale>
#include <sstream>
#endif

namespace vesk {

namespace {

void SetBits(void* address, std::size_t size, uint128 value) {
  auto set = [address](auto bits) { std::memcpy(address, &bits, sizeof(bits)); };
  if (size == 1) return set(static_cast<uint8>(value));
  if (size == 2) return set(static_cast<uint16>(value));
  if (size == 4) return set(static_cast<uint32>(value));
  if (size == 8) return set(static_cast<uint64>(value));
  set(value);
}

// False for a number that is no F: too large, or too small.
template <typename F>
bool ParseFloat(std::string_view text, F& value) {
#ifdef __cpp_lib_to_chars
  return std::from_chars(text.data(), text.data() + text.size(), value).ec == std::errc();
#else
  std::istringstream stream{std::string(text)};
  stream.imbue(std::locale::classic());
  return static_cast<bool>(stream >> value);
#endif
}

// Whether a number that is out of range is so because of its size: its first digit stands before the point.
bool IsLarge(std::string_view text) {
  const std::size_t e = std::min(text.find_first_of("eE"), text.size());
  int64 exponent = 0;
  if (e < text.size()) {
    std::string_view digits = text.substr(e + 1);
    if (digits[0] == '+') digits.remove_prefix(1);
    const bool isNegative = digits[0] == '-';
    const auto result = std::from_chars(digits.data(), digits.data() + digits.size(), exponent);
    if (result.ec != std::errc()) return !isNegative;
  }
  const std::size_t first = std::min(text.find_first_of("123456789"), e);
  const std::size_t point = std::min(text.find('.'), e);
  return static_cast<int64>(point) - static_cast<int64>(first) + exponent > 0;
}

template <typename F>
void ReadFloat(JsonScanner& scanner, F& value) {
  const std::size_t at = scanner.Here();
  if (scanner.Peek() == '"') {
    const std::string text = scanner.ReadString8();
    if (text == "NaN") {
      value = std::numeric_limits<F>::quiet_NaN();
    } else if (text == "Infinity" || text == "-Infinity") {
      value = text[0] == '-' ? -std::numeric_limits<F>::infinity() : std::numeric_limits<F>::infinity();
    } else {
      scanner.FailAt(at, "expected a number");
    }
    return;
  }
  const std::string_view text = scanner.ReadNumber();
  F read = 0;
  if (!ParseFloat(text, read)) {
    if (IsLarge(text)) scanner.FailAt(at, "out of range");
    read = 0;
  }
  value = read;
}

}  // namespace

void ReadJsonBool(JsonScanner& scanner, void* address) {
  bool& value = *static_cast<bool*>(address);
  if (scanner.AcceptWord("true")) {
    value = true;
  } else if (scanner.AcceptWord("false")) {
    value = false;
  } else {
    scanner.Fail("expected true or false");
  }
}

void ReadJsonInteger(JsonScanner& scanner, ValueType const& type, void* address) {
  const std::size_t at = scanner.Here();
  const bool isText = scanner.Peek() == '"';
  SetJsonInteger(scanner, type, address, isText ? scanner.ReadString8() : std::string(scanner.ReadNumber()), at);
}

void SetJsonInteger(JsonScanner& scanner, ValueType const& type, void* address, std::string_view text, std::size_t at) {
  const bool isNegative = !text.empty() && text[0] == '-';
  if (isNegative) text.remove_prefix(1);
  const int bits = static_cast<int>(type.m_size) * 8;
  uint128 most = ~uint128(0) >> (128 - bits);
  if (type.m_kind == VK_INT) most = (most >> 1) + isNegative;
  if (type.m_kind == VK_UINT && isNegative) most = 0;
  uint128 value = 0;
  if (text.empty()) scanner.FailAt(at, "expected digits");
  for (char c : text) {
    if (c < '0' || c > '9') scanner.FailAt(at, "expected an integer");
    const uint128 digit = static_cast<uint128>(c - '0');
    if (value > (most - std::min(most, digit)) / 10 || (value == 0 && digit > most)) {
      scanner.FailAt(at, "out of the range of " + type.m_text);
    }
    value = value * 10 + digit;
  }
  if (isNegative) value = -value;
  SetBits(address, type.m_size, value);
}

void ReadJsonChar(JsonScanner& scanner, ValueType const& type, void* address) {
  const std::size_t at = scanner.Here();
  const uint32 most = type.m_size == 1 ? 0xFF : 0xFFFF;
  uint32 value = most + 1;
  if (scanner.Peek() == '"') {
    const std::u16string text = scanner.ReadString16();
    if (text.size() == 1 && (type.m_size == 2 || text[0] < 0x80)) value = text[0];
  } else {
    const std::string_view text = scanner.ReadNumber();
    const char* const end = text.data() + text.size();
    if (std::from_chars(text.data(), end, value).ptr != end) value = most + 1;
  }
  if (value > most) scanner.FailAt(at, "expected a character");
  SetBits(address, type.m_size, value);
}

void ReadJsonEnum(JsonScanner& scanner, ValueType const& type, int32& value) {
  const std::size_t at = scanner.Here();
  const bool isText = scanner.Peek() == '"';
  SetJsonEnum(scanner, type, value, isText ? scanner.ReadString8() : std::string(scanner.ReadNumber()), isText, at);
}

void SetJsonEnum(JsonScanner& scanner, ValueType const& type, int32& value, std::string const& text, bool isLabel,
                 std::size_t at) {
  ReflectedEnum const* record = type.m_enum;
  for (ssize_t i = 0; record && i < record->m_numLabels; ++i) {
    const int32 number = record->m_values ? record->m_values[i] : static_cast<int32>(i);
    if (isLabel ? text != record->m_labels[i] : text != std::to_string(number)) continue;
    value = number;
    return;
  }
  scanner.FailAt(at, "no label of " + type.m_text + ": " + text);
}

void ReadJsonFloat(JsonScanner& scanner, float32& value) { ReadFloat(scanner, value); }
void ReadJsonFloat(JsonScanner& scanner, float64& value) { ReadFloat(scanner, value); }

}  // namespace vesk
