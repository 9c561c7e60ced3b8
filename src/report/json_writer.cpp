#include "report/json_writer.h"

#include <charconv>

#include "platform/console.h"

namespace qrex {

JsonWriter& JsonWriter::Value(std::string_view text) {
  constexpr char kDigits[] = "0123456789abcdef";
  const bool isUtf8 = platform::IsValidUtf8(text);
  const std::string widened = isUtf8 ? std::string() : platform::WidenBytes(text);
  Separate();
  m_text += '"';
  for (const char c : isUtf8 ? text : std::string_view(widened)) {
    if (c == '"' || c == '\\') {
      m_text.append(1, '\\').append(1, c);
    } else if (static_cast<unsigned char>(c) < ' ' || c == '<' || c == '\x7f') {
      m_text.append("\\u00").append(1, kDigits[c >> 4]).append(1, kDigits[c & 15]);
    } else {
      m_text += c;
    }
  }
  m_text += '"';
  return *this;
}

JsonWriter& JsonWriter::Value(double number) {
  char digits[32];
  const auto end = std::to_chars(digits, digits + sizeof digits, number).ptr;
  Separate();
  m_text.append(digits, end);
  return *this;
}

}  // namespace qrex
