// Strings, and the stream that generated text prints to: std::ostream with an indentation, and an overload set of its
// own so that every reflected type prints, containers included. Numbers of 8 bits print as numbers, bool as a word.

@import "Vesk/vxObject/Platform.h"

#include <algorithm>
#include <atomic>
#include <cstring>
#include <iosfwd>
#include <stdexcept>
#include <string>
#include <string_view>

namespace vesk {

template <typename C>
class basic_xstring : public std::basic_string<C> {
 public:
  typedef std::basic_string<C> base;
  using base::base;
  using base::insert;
  using typename base::const_iterator;
  using typename base::iterator;
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
  ~xostream() {
    if (m_stream) DropStream();
    std::free(m_text);
  }
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
  void WriteNumber(int value);
  void WriteNumber(unsigned value);
  void WriteNumber(long value);
  void WriteNumber(unsigned long value);
  void WriteNumber(long long value);
  void WriteNumber(unsigned long long value);
  void WriteNumber(float value);
  void WriteNumber(double value);
  void WriteNumber(long double value);
  void WriteAddress(void const* address);

  void ChangeIndent(int by);
  // For what only a std::ostream prints; no indentation there.
  std::ostream& Target();
  // What was written into memory; it begins anew.
  xstring TakeText();

 private:
  struct MemoryStream;
  enum { MostDigits = 64 };

  void OfferRoom();
  void TakeRoom();
  int Indent() const { return m_indent.load(std::memory_order_relaxed); }
  void SetAtLineStart(bool is) { m_atLineStart.store(is, std::memory_order_relaxed); }
  void WriteLines(std::string_view text);
  std::string IndentedText(std::string_view text, std::size_t indent) const;
  void Append(std::string_view text);
  void Grow(std::size_t by);
  void DropStream();
  template <typename T>
  void WriteShortest(T value);

  char* m_at = nullptr;
  char* m_end = nullptr;
  std::ostream* m_target;
  MemoryStream* m_stream = nullptr;
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
xostream& xout();

void AppendUtf8(std::string& text, uint32 c);
std::string Utf8Text(std::u16string_view units);
std::string DecimalText(uint128 value);

// Functions have one, too.
template <typename T>
void const* AddressOf(T* pointer) {
  return reinterpret_cast<void const*>(reinterpret_cast<std::uintptr_t>(pointer));
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
  os.WriteAddress(AddressOf(address));
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
