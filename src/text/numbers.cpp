#include "text/numbers.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <limits>

namespace qrex {

namespace {

std::string General(double value, int precision) {
  char text[64];
  const int length = std::snprintf(text, sizeof text, "%.*g", precision, value);
  return std::string(text, static_cast<size_t>(length));
}

// Vertical tab and form feed do not count as white space here.
const char* SkipBlanks(const std::string& text) {
  const size_t at = text.find_first_not_of(" \t\n\r");
  return text.c_str() + (at == std::string::npos ? text.size() : at);
}

template <typename Read>
auto Convert(const std::string& text, const char* what, std::string& error, bool& ok, Read read) {
  const char* begin = SkipBlanks(text);
  char* end = nullptr;
  const auto value = read(begin, &end);
  ok = false;
  if (*begin == 0 && begin == text.c_str() + text.size()) {
    error = "Empty string";
  } else if (*begin == '\v' || *begin == '\f' || end == begin || end != text.c_str() + text.size()) {
    error = what;
  } else {
    ok = true;
  }
  return value;
}

constexpr char kNoNumber[] = "String doesn't represent a number";
constexpr char kNoFloat[] = "String doesn't represent a floating point number";

template <typename T>
bool ParseInteger(const std::string& text, T& value, std::string& error, int radix) {
  bool ok;
  if constexpr (std::is_same_v<T, uint64_t>) {
    const uint64_t read = Convert(text, kNoNumber, error, ok,
                                  [&](const char* begin, char** end) { return std::strtoull(begin, end, radix); });
    if (ok) value = read;
    return ok;
  } else {
    const int64_t read = Convert(text, kNoNumber, error, ok,
                                 [&](const char* begin, char** end) { return std::strtoll(begin, end, radix); });
    if (!ok) return false;
    value = static_cast<T>(read);
    if (read == static_cast<int64_t>(value) && (read >= 0) == (value >= 0)) return true;
    error = "Out of range";
    return false;
  }
}

}  // namespace

std::string ToString(int64_t value) { return std::to_string(value); }
std::string ToString(uint64_t value) { return std::to_string(value); }
std::string ToString(float value) { return General(value, 10); }
std::string ToString(double value) { return General(value, 20); }

bool ParseNumber(const std::string& text, int8_t& value, std::string& error, int radix) {
  return ParseInteger(text, value, error, radix);
}
bool ParseNumber(const std::string& text, int16_t& value, std::string& error, int radix) {
  return ParseInteger(text, value, error, radix);
}
bool ParseNumber(const std::string& text, int32_t& value, std::string& error, int radix) {
  return ParseInteger(text, value, error, radix);
}
bool ParseNumber(const std::string& text, int64_t& value, std::string& error, int radix) {
  return ParseInteger(text, value, error, radix);
}
bool ParseNumber(const std::string& text, uint8_t& value, std::string& error, int radix) {
  return ParseInteger(text, value, error, radix);
}
bool ParseNumber(const std::string& text, uint16_t& value, std::string& error, int radix) {
  return ParseInteger(text, value, error, radix);
}
bool ParseNumber(const std::string& text, uint32_t& value, std::string& error, int radix) {
  return ParseInteger(text, value, error, radix);
}
bool ParseNumber(const std::string& text, uint64_t& value, std::string& error, int radix) {
  return ParseInteger(text, value, error, radix);
}

bool ParseFloat(const std::string& text, double& value, std::string& error) {
  bool ok;
  const double read =
      Convert(text, kNoFloat, error, ok, [](const char* begin, char** end) { return std::strtod(begin, end); });
  if (ok) value = read;
  return ok;
}

bool ParseFloat(const std::string& text, float& value, std::string& error) {
  double read;
  if (!ParseFloat(text, read, error)) return false;
  value = static_cast<float>(read);
  return true;
}

// The number of set bits at the head of the first byte tells how many bytes follow; four of them mean a plain 32-bit
// value.
void AppendCompactLength(std::string& out, uint64_t value) {
  if (value < (1u << 7)) {
    out += static_cast<char>(value);
  } else if (value < (1u << 14)) {
    out += static_cast<char>(0x80 | value >> 8);
    out += static_cast<char>(value);
  } else if (value < (1u << 21)) {
    out += static_cast<char>(0xC0 | value >> 16);
    out += static_cast<char>(value >> 8);
    out += static_cast<char>(value);
  } else {
    if (value < (1u << 28)) {
      out += static_cast<char>(0xE0 | value >> 24);
    } else {
      out += static_cast<char>(0xF0);
      out += static_cast<char>(value >> 24);
    }
    out += static_cast<char>(value >> 16);
    out += static_cast<char>(value >> 8);
    out += static_cast<char>(value);
  }
}

bool ReadCompactLength(std::string_view& in, uint64_t& value) {
  if (in.empty()) return false;
  const unsigned char first = static_cast<unsigned char>(in.front());
  const size_t more = first < 0x80 ? 0 : first < 0xC0 ? 1 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
  if (in.size() < more + 1) return false;
  value = more == 4 ? 0 : first & (0x7F >> more);
  for (size_t i = 1; i <= more; ++i) value = value << 8 | static_cast<unsigned char>(in[i]);
  in.remove_prefix(more + 1);
  return true;
}

void AppendCompactString(std::string& out, std::string_view text) {
  AppendCompactLength(out, text.size());
  out += text;
}

bool ReadCompactString(std::string_view& in, std::string_view& text) {
  uint64_t length;
  if (!ReadCompactLength(in, length) || length > in.size()) return false;
  text = in.substr(0, static_cast<size_t>(length));
  in.remove_prefix(static_cast<size_t>(length));
  return true;
}

void SplitString(std::string_view text, std::vector<std::string>& out, std::string_view separators) {
  out.clear();
  for (size_t begin = 0; (begin = text.find_first_not_of(separators, begin)) != std::string_view::npos;) {
    const size_t end = std::min(text.find_first_of(separators, begin), text.size());
    out.emplace_back(text.substr(begin, end - begin));
    begin = end;
  }
}

void ReplaceChar(std::string_view text, std::string& out, char from, char to) {
  out = text;
  std::replace(out.begin(), out.end(), from, to);
}

void ReplaceAll(std::string_view text, std::string& out, std::string_view pattern, std::string_view replacement) {
  std::string result;
  if (!pattern.empty()) {
    for (size_t at; (at = text.find(pattern)) != std::string_view::npos; text.remove_prefix(at + pattern.size())) {
      result.append(text.substr(0, at)).append(replacement);
    }
  }
  out = result.append(text);
}

void ReplaceAllInPlace(std::string& text, std::string_view pattern, std::string_view replacement) {
  ReplaceAll(std::string(text), text, pattern, replacement);
}

void ToLower(std::string& text) {
  for (char& c : text) {
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c + ('a' - 'A'));
  }
}

void ToUpper(std::string& text) {
  for (char& c : text) {
    if (c >= 'a' && c <= 'z') c = static_cast<char>(c - ('a' - 'A'));
  }
}

}  // namespace qrex
