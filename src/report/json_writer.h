// JSON, written in the order in which it stands. The text is ASCII but for UTF-8 that was given; `<` is escaped, so
// that it can stand in a page.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace qrex {

class JsonWriter {
 public:
  JsonWriter& Open(char bracket) {  // [ or {
    Separate();
    m_text += bracket;
    m_isFirst = true;
    return *this;
  }
  JsonWriter& Close(char bracket) {
    m_text += bracket;
    m_isFirst = false;
    return *this;
  }
  JsonWriter& Key(std::string_view name) {
    Value(name);
    m_text += ':';
    m_isFirst = true;
    return *this;
  }
  JsonWriter& Value(std::string_view text);  // bytes that are no UTF-8 as the characters of their numbers
  JsonWriter& Value(const char* text) { return Value(std::string_view(text)); }
  JsonWriter& Value(int64_t number) {
    Separate();
    m_text += std::to_string(number);
    return *this;
  }
  JsonWriter& Value(double number);  // a finite one, in as many digits as bring it back
  JsonWriter& Value(bool value) {
    Separate();
    m_text += value ? "true" : "false";
    return *this;
  }
  template <typename T>
  JsonWriter& Member(std::string_view name, const T& value) {
    return Key(name).Value(value);
  }
  JsonWriter& Json(std::string_view text) {  // a value that is written already
    Separate();
    m_text += text;
    return *this;
  }
  JsonWriter& Line() {  // of the text; ahead of a value
    Separate();
    m_text += '\n';
    m_isFirst = true;
    return *this;
  }
  const std::string& Text() const { return m_text; }

 private:
  void Separate() {
    if (!m_isFirst) m_text += ',';
    m_isFirst = false;
  }

  std::string m_text;
  bool m_isFirst = true;
};

}  // namespace qrex
