// Streams, as far as they do more than append; text in UTF-8; what is said of an assertion that fails.

@import "Vesk/vxObject/Text.h"

#include <charconv>
#include <iostream>

namespace vesk {

void FailAssertion(ConstStringZ expression, ConstStringZ file, int line) {
  std::cerr << file << "(" << line << ") : assertion failed : " << expression << std::endl;
  std::abort();
}

// --- Streams

struct xostream::MemoryStream : private std::streambuf, public std::ostream {
  typedef std::char_traits<char> traits_type;
  explicit MemoryStream(xostream& text) : std::ostream(this), m_text(text) {}
  std::streamsize xsputn(char const* text, std::streamsize size) override {
    m_text.TakeRoom();
    m_text.Append(std::string_view(text, static_cast<std::size_t>(size)));
    m_text.OfferRoom();
    return size;
  }
  int overflow(int c) override {
    const char character = static_cast<char>(c);
    if (c != traits_type::eof()) xsputn(&character, 1);
    return 0;
  }
  xostream& m_text;
};

template <typename T>
inline void xostream::WriteShortest(T value) {
  if (m_end - m_at >= MostDigits) {
    m_at = std::to_chars(m_at, m_at + MostDigits, value).ptr;
    return;
  }
  char text[MostDigits];
  WriteLines(
      std::string_view(text, static_cast<std::size_t>(std::to_chars(text, text + MostDigits, value).ptr - text)));
}
void xostream::WriteNumber(int value) { WriteShortest(value); }
void xostream::WriteNumber(unsigned value) { WriteShortest(value); }
void xostream::WriteNumber(long value) { WriteShortest(value); }
void xostream::WriteNumber(unsigned long value) { WriteShortest(value); }
void xostream::WriteNumber(long long value) { WriteShortest(value); }
void xostream::WriteNumber(unsigned long long value) { WriteShortest(value); }
void xostream::WriteNumber(float value) { WriteShortest(value); }
void xostream::WriteNumber(double value) { WriteShortest(value); }
void xostream::WriteNumber(long double value) { WriteShortest(value); }

void xostream::WriteAddress(void const* address) {
  char text[2 + 2 * sizeof(address)] = {'0', 'x'};
  const std::uintptr_t number = reinterpret_cast<std::uintptr_t>(address);
  char* const end = number ? std::to_chars(text + 2, text + sizeof(text), number, 16).ptr : text + 1;
  Write(std::string_view(text, static_cast<std::size_t>(end - text)));
}

void xostream::ChangeIndent(int by) {
  TakeRoom();
  if (m_target) {
    m_indent.fetch_add(by, std::memory_order_relaxed);
  } else {
    m_indent.store(Indent() + by, std::memory_order_relaxed);
  }
  OfferRoom();
}

std::ostream& xostream::Target() {
  if (!m_target && !m_stream) m_stream = new MemoryStream(*this);
  return m_target ? *m_target : *m_stream;
}
void xostream::DropStream() { delete m_stream; }

xstring xostream::TakeText() {
  TakeRoom();
  return std::string(m_text ? m_text : "", std::exchange(m_size, 0));
}

// The room is m_text behind m_size, as long as it is offered.
void xostream::OfferRoom() {
  if (m_target || Indent() != 0 || !m_text) return;
  m_at = m_text + m_size;
  m_end = m_text + m_capacity;
}
void xostream::TakeRoom() {
  if (!m_end) return;
  const std::size_t size = static_cast<std::size_t>(m_at - m_text);
  if (size != m_size) SetAtLineStart(m_text[size - 1] == '\n');
  m_size = size;
  m_at = m_end = nullptr;
}

// Some text.
void xostream::WriteLines(std::string_view text) {
  TakeRoom();
  const int indent = Indent();
  if (indent == 0) {
    Append(text);
  } else {
    Append(IndentedText(text, indent > 0 ? static_cast<std::size_t>(indent) : 0));
  }
  SetAtLineStart(text.back() == '\n');
  OfferRoom();
}
// Empty lines stay empty.
std::string xostream::IndentedText(std::string_view text, std::size_t indent) const {
  std::string lines;
  bool atLineStart = m_atLineStart.load(std::memory_order_relaxed);
  for (const char c : text) {
    if (atLineStart && c != '\n') lines.append(indent, ' ');
    lines += c;
    atLineStart = c == '\n';
  }
  return lines;
}
void xostream::Append(std::string_view text) {
  if (m_target) {
    m_target->write(text.data(), static_cast<std::streamsize>(text.size()));
    return;
  }
  if (text.empty()) return;
  if (m_capacity - m_size < text.size() + MostDigits) Grow(text.size() + MostDigits);
  std::memcpy(m_text + m_size, text.data(), text.size());
  m_size += text.size();
}

// Large blocks are moved by their pages.
void xostream::Grow(std::size_t by) {
  const std::size_t capacity = std::max(2 * m_capacity, m_size + by);
  void* text = std::realloc(m_text, capacity);
  if (!text) throw std::bad_alloc();
  m_text = static_cast<char*>(text);
  m_capacity = capacity;
}

xostream& xout() {
  static xostream* const os = new xostream(std::cout);  // outlives every static object
  return *os;
}

// --- Characters and digits

void AppendUtf8(std::string& text, uint32 c) {
  if (c < 0x80) {
    text += static_cast<char>(c);
    return;
  }
  const int more = c < 0x800 ? 1 : c < 0x10000 ? 2 : 3;
  text += static_cast<char>((0xF00 >> (more + 1) & 0xFF) | c >> 6 * more);
  for (int i = more - 1; i >= 0; --i) text += static_cast<char>(0x80 | (c >> 6 * i & 0x3F));
}

std::string Utf8Text(std::u16string_view units) {
  std::string text;
  for (std::size_t i = 0; i < units.size(); ++i) {
    uint32 c = units[i];
    const bool isPair = (c & 0xFC00) == 0xD800 && i + 1 < units.size() && (units[i + 1] & 0xFC00) == 0xDC00;
    if (isPair) c = 0x10000 + ((c & 0x3FF) << 10) + (units[++i] & 0x3FF);
    AppendUtf8(text, c);
  }
  return text;
}

std::string DecimalText(uint128 value) {
  std::string digits;
  do digits.insert(digits.begin(), static_cast<char>('0' + static_cast<int>(value % 10)));
  while (value /= 10);
  return digits;
}

}  // namespace vesk
