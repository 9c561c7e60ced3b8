// Strings, and the stream that generated text prints to: std::ostream with an indentation, and an overload set of its
// own so that every reflected type prints, containers included. Numbers of 8 bits print as numbers, bool as a word.

@import "Vesk/vxObject/Platform.h"

#include <algorithm>
#include <atomic>
#include <charconv>
#include <cstring>
#include <iostream>
#include <stdexcept>
#include <string>
#include <string_view>

namespace vesk {

template <typename C>
class basic_xstring : public std::basic_string<C> {
 public:
  typedef std::basic_string<C> base;
  using typename base::const_iterator;
  using typename base::iterator;
  using base::base;
  using base::insert;
  basic_xstring() {}
  basic_xstring(base const& text) : base(text) {}
  basic_xstring(base&& text) : base(std::move(text)) {}
  // A hook may have taken the position away since it was asked for: std::out_of_range.
  iterator insert(const_iterator at, C const* first, C const* last) {
    if (at - base::cbegin() > base::cend() - base::cbegin()) throw std::out_of_range("position to insert at");
    return base::insert(at, first, last);
  }
};
typedef basic_xstring<char8> string8;
typedef basic_xstring<char16> string16;
typedef string8 xstring;

namespace unqualified {
using vesk::string16;
using vesk::string8;
using vesk::xstring;
}  // namespace unqualified

// Writes to a std::ostream, or without one into memory. What is written into memory without an indentation is put where
// there is room for it at once; all else, and where there is none, goes the long way. With a target each insertion is
// one write to it, and what is kept besides is atomic: threads may share the stream as far as they may its target.
class xostream {
 public:
  explicit xostream(std::ostream& target) : m_target(&target) {}
  xostream() : m_target(nullptr) {}
  ~xostream() { std::free(m_text); }
  xostream(xostream const&) = delete;
  void operator=(xostream const&) = delete;

  void Write(std::string_view text) {
    if (text.size() > static_cast<std::size_t>(m_end - m_at)) return WriteLines(text);
    if (text.empty()) return;
    std::memcpy(m_at, text.data(), text.size());
    m_at += text.size();
  }
  void Write(char8 c) {
    if (m_at == m_end) return WriteLines(std::string_view(&c, 1));
    *m_at++ = c;
  }

  // In the shortest form that reads back as the same number, whatever the locale.
  template <typename T>
  void WriteNumber(T value) {
    if (m_end - m_at >= MostDigits) {
      m_at = std::to_chars(m_at, m_at + MostDigits, value).ptr;
      return;
    }
    char text[MostDigits];
    WriteLines(std::string_view(text, std::to_chars(text, text + MostDigits, value).ptr - text));
  }

  void ChangeIndent(int by) {
    TakeRoom();
    if (m_target) {
      m_indent.fetch_add(by, std::memory_order_relaxed);
    } else {
      m_indent.store(Indent() + by, std::memory_order_relaxed);
    }
    OfferRoom();
  }

  // For what only a std::ostream prints; no indentation there.
  std::ostream& Target() {
    if (!m_target && !m_stream) m_stream = std::make_unique<MemoryStream>(*this);
    return m_target ? *m_target : *m_stream;
  }

  // What was written into memory; it begins anew.
  xstring TakeText() {
    TakeRoom();
    return std::string(m_text ? m_text : "", std::exchange(m_size, 0));
  }

 private:
  struct MemoryStream : private std::streambuf, public std::ostream {
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

  enum { MostDigits = 64 };

  // The room is m_text behind m_size, as long as it is offered.
  void OfferRoom() {
    if (m_target || Indent() != 0 || !m_text) return;
    m_at = m_text + m_size;
    m_end = m_text + m_capacity;
  }
  void TakeRoom() {
    if (!m_end) return;
    const std::size_t size = static_cast<std::size_t>(m_at - m_text);
    if (size != m_size) SetAtLineStart(m_text[size - 1] == '\n');
    m_size = size;
    m_at = m_end = nullptr;
  }

  int Indent() const { return m_indent.load(std::memory_order_relaxed); }
  void SetAtLineStart(bool is) { m_atLineStart.store(is, std::memory_order_relaxed); }

  // Some text.
  void WriteLines(std::string_view text) {
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
  std::string IndentedText(std::string_view text, std::size_t indent) const {
    std::string lines;
    bool atLineStart = m_atLineStart.load(std::memory_order_relaxed);
    for (const char c : text) {
      if (atLineStart && c != '\n') lines.append(indent, ' ');
      lines += c;
      atLineStart = c == '\n';
    }
    return lines;
  }
  void Append(std::string_view text) {
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
  void Grow(std::size_t by) {
    const std::size_t capacity = std::max(2 * m_capacity, m_size + by);
    void* text = std::realloc(m_text, capacity);
    if (!text) throw std::bad_alloc();
    m_text = static_cast<char*>(text);
    m_capacity = capacity;
  }

  char* m_at = nullptr;
  char* m_end = nullptr;
  std::ostream* m_target;
  std::unique_ptr<MemoryStream> m_stream;
  char* m_text = nullptr;
  std::size_t m_size = 0;
  std::size_t m_capacity = 0;
  std::atomic<int> m_indent{0};
  std::atomic<bool> m_atLineStart{true};
};

// Lines written while it lives are indented and stand in braces.
class ScopeWriter2 {
 public:
  explicit ScopeWriter2(xostream& os) : m_os(os) {
    m_os.Write("{\n");
    m_os.ChangeIndent(4);
  }
  ~ScopeWriter2() {
    m_os.ChangeIndent(-4);
    m_os.Write("}\n");
  }
  ScopeWriter2(ScopeWriter2 const&) = delete;
  void operator=(ScopeWriter2 const&) = delete;

 private:
  xostream& m_os;
};

// The standard output.
inline xostream& xout() {
  static xostream* const os = new xostream(std::cout);  // outlives every static object
  return *os;
}

inline void AppendUtf8(std::string& text, uint32 c) {
  if (c < 0x80) {
    text += static_cast<char>(c);
    return;
  }
  const int more = c < 0x800 ? 1 : c < 0x10000 ? 2 : 3;
  text += static_cast<char>((0xF00 >> (more + 1) & 0xFF) | c >> 6 * more);
  for (int i = more - 1; i >= 0; --i) text += static_cast<char>(0x80 | (c >> 6 * i & 0x3F));
}

inline std::string Utf8Text(std::u16string_view units) {
  std::string text;
  for (std::size_t i = 0; i < units.size(); ++i) {
    uint32 c = units[i];
    const bool isPair = (c & 0xFC00) == 0xD800 && i + 1 < units.size() && (units[i + 1] & 0xFC00) == 0xDC00;
    if (isPair) c = 0x10000 + ((c & 0x3FF) << 10) + (units[++i] & 0x3FF);
    AppendUtf8(text, c);
  }
  return text;
}

inline std::string DecimalText(uint128 value) {
  std::string digits;
  do digits.insert(digits.begin(), static_cast<char>('0' + static_cast<int>(value % 10)));
  while (value /= 10);
  return digits;
}

template <typename T>
constexpr bool IsArithmetic =
    std::is_arithmetic<T>::value || std::is_same<T, int128>::value || std::is_same<T, uint128>::value;

template <typename T, typename = std::enable_if_t<IsArithmetic<T>>>
xostream& operator<<(xostream& os, T value) {
  if constexpr (std::is_same<T, bool>::value) {
    os.Write(value ? "true" : "false");
  } else if constexpr (std::is_same<T, char8>::value) {
    os.Write(value);
  } else if constexpr (std::is_same<T, char16>::value) {
    os.Write(Utf8Text(std::u16string_view(&value, 1)));
  } else if constexpr (sizeof(T) == 16 && !std::is_floating_point<T>::value) {
    const bool isNegative = value < 0;
    os.Write((isNegative ? "-" : "") +
             DecimalText(isNegative ? -static_cast<uint128>(value) : static_cast<uint128>(value)));
  } else {
    os.WriteNumber(+value);
  }
  return os;
}

inline xostream& operator<<(xostream& os, std::string_view text) {
  os.Write(text);
  return os;
}
inline xostream& operator<<(xostream& os, ConstStringZ text) {
  os.Write(text ? text : "(null)");
  return os;
}
inline xostream& operator<<(xostream& os, string8 const& text) {
  os.Write(text);
  return os;
}
inline xostream& operator<<(xostream& os, std::string const& text) {
  os.Write(text);
  return os;
}
inline xostream& operator<<(xostream& os, string16 const& text) {
  os.Write(Utf8Text(text));
  return os;
}

template <typename T>
xostream& operator<<(xostream& os, T* address) {
  char text[2 + 2 * sizeof(address)] = {'0', 'x'};
  const std::uintptr_t number = reinterpret_cast<std::uintptr_t>(address);
  char* end = number ? std::to_chars(text + 2, text + sizeof(text), number, 16).ptr : text + 1;
  os.Write(std::string_view(text, end - text));
  return os;
}

// Without this one, an array of characters would be an address.
inline xostream& operator<<(xostream& os, char* text) { return os << static_cast<ConstStringZ>(text); }

template <typename A, typename B>
xostream& operator<<(xostream& os, std::pair<A, B> const& pair) {
  return os << '(' << pair.first << ',' << pair.second << ')';
}

// Fields of models and nodes of the dependency graph print what they read.
template <typename T, typename Value = decltype(std::declval<T const&>().read())>
auto operator<<(xostream& os, T const& field) -> decltype(os << std::declval<Value>()) {
  return os << field.read();
}

template <typename Print>
xstring TextOf(Print print) {
  xostream os;
  print(os);
  return os.TakeText();
}

}  // namespace vesk

// The text of a chain of insertions: vxMakeString("f(" << x << ')').
#define vxMakeString(chain) (::vesk::TextOf([&](::vesk::xostream& os_) { os_ << chain; }))
