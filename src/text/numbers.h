// Numbers to text and back outside the scanner's literals, the compact length, and small string operations.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace qrex {

std::string ToString(int64_t value);
std::string ToString(uint64_t value);
inline std::string ToString(int32_t value) { return ToString(static_cast<int64_t>(value)); }
inline std::string ToString(uint32_t value) { return ToString(static_cast<uint64_t>(value)); }
std::string ToString(float value);   // general format, 10 significant digits
std::string ToString(double value);  // general format, 20 significant digits

// True on success; otherwise `error` tells why ("Empty string", "String doesn't represent a number", "Out of range").
bool ParseNumber(const std::string& text, int8_t& value, std::string& error, int radix = 10);
bool ParseNumber(const std::string& text, int16_t& value, std::string& error, int radix = 10);
bool ParseNumber(const std::string& text, int32_t& value, std::string& error, int radix = 10);
bool ParseNumber(const std::string& text, int64_t& value, std::string& error, int radix = 10);
bool ParseNumber(const std::string& text, uint8_t& value, std::string& error, int radix = 10);
bool ParseNumber(const std::string& text, uint16_t& value, std::string& error, int radix = 10);
bool ParseNumber(const std::string& text, uint32_t& value, std::string& error, int radix = 10);
bool ParseNumber(const std::string& text, uint64_t& value, std::string& error, int radix = 10);
bool ParseFloat(const std::string& text, double& value, std::string& error);
bool ParseFloat(const std::string& text, float& value, std::string& error);

// The compact length: big-endian groups, shorter for smaller values (the form of the byte code and of our binary
// files).
void AppendCompactLength(std::string& out, uint64_t value);
bool ReadCompactLength(std::string_view& in, uint64_t& value);      // moves `in` on; false when it is cut short
void AppendCompactString(std::string& out, std::string_view text);  // length, then the bytes
bool ReadCompactString(std::string_view& in, std::string_view& text);

void SplitString(std::string_view text, std::vector<std::string>& out, std::string_view separators);
void ReplaceChar(std::string_view text, std::string& out, char from, char to);
void ReplaceAll(std::string_view text, std::string& out, std::string_view pattern, std::string_view replacement);
void ReplaceAllInPlace(std::string& text, std::string_view pattern, std::string_view replacement);
void ToLower(std::string& text);
void ToUpper(std::string& text);

}  // namespace qrex
