// The messages of the inspector as text: JSON, read into a tree with bounds, and written. What is read comes from
// anyone; what is written is UTF-8, whatever bytes a program's strings hold.

@import "Vesk/vxObject/Access.h"

#include <charconv>
#include <optional>

namespace vesk {

// A request that cannot be carried out: the text is shown to who asked.
class InspectorError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The text of what is being caught; want of memory goes on.
inline xstring InspectorErrorText() {
  try {
    throw;
  } catch (std::bad_alloc const&) {
    throw;
  } catch (std::exception const& error) {
    return error.what();
  } catch (...) {
    return "something was thrown that is no std::exception";
  }
}

// A message, or a part of one. Its texts point into the message, which must outlive it.
struct InspectorJson {
  enum EKind { Null, Bool, Number, Text, List, Object };
  EKind m_kind = Null;
  bool m_bool = false;
  std::string_view m_raw;          // as it stands in the message
  xstring m_text;                  // of a text
  xvector<InspectorJson> m_items;  // of a list or object
  xvector<xstring> m_names;        // of an object, one for each item

  // InspectorError for what is no JSON or too deep.
  static InspectorJson Parse(std::string_view text);

  // Null where there is no such member.
  InspectorJson const& operator[](std::string_view name) const {
    static const InspectorJson nothing;
    for (std::size_t i = 0; i < m_names.size(); ++i) {
      if (m_names[i] == name) return m_items[i];
    }
    return nothing;
  }
  xstring const& AsText() const {
    if (m_kind != Text) throw InspectorError("expected a text");
    return m_text;
  }
  // A whole number; `otherwise` where there is none.
  ssize_t AsCount(ssize_t otherwise) const {
    if (m_kind == Null) return otherwise;
    int64 number = 0;
    const auto end = std::from_chars(m_raw.data(), m_raw.data() + m_raw.size(), number);
    if (m_kind != Number || end.ptr != m_raw.data() + m_raw.size()) throw InspectorError("expected a whole number");
    return static_cast<ssize_t>(number);
  }
  bool IsTrue() const { return m_kind == Bool && m_bool; }
};

class InspectorJsonReader {
 public:
  explicit InspectorJsonReader(std::string_view text) : m_text(text) {}

  InspectorJson ReadAll() {
    InspectorJson value = Read(0);
    if (Peek() != '\0' || m_at < m_text.size()) Fail();
    return value;
  }

 private:
  static constexpr int kDepth = 32;
  static constexpr std::size_t kItems = 100000;  // of a message

  [[noreturn]] static void Fail() { throw InspectorError("the message is no JSON"); }

  char Peek() {
    while (m_at < m_text.size() && std::strchr(" \t\r\n", m_text[m_at]) && m_text[m_at] != '\0') ++m_at;
    return m_at < m_text.size() ? m_text[m_at] : '\0';
  }
  bool Accept(char c) {
    if (Peek() != c || m_at == m_text.size()) return false;
    ++m_at;
    return true;
  }
  bool AcceptWord(std::string_view word) {
    if (m_text.substr(m_at, word.size()) != word) return false;
    m_at += word.size();
    return true;
  }

  InspectorJson Read(int depth) {
    if (depth > kDepth || ++m_items > kItems) throw InspectorError("the message is too large");
    InspectorJson value;
    const char first = Peek();
    const std::size_t begin = m_at;
    if (first == '{' || first == '[') {
      ReadItems(value, depth);
    } else if (first == '"') {
      value.m_kind = InspectorJson::Text;
      value.m_text = ReadText();
    } else if (AcceptWord("true") || AcceptWord("false")) {
      value.m_kind = InspectorJson::Bool;
      value.m_bool = first == 't';
    } else if (!AcceptWord("null")) {
      value.m_kind = InspectorJson::Number;
      while (m_at < m_text.size() && std::strchr("+-.0123456789eE", m_text[m_at]) && m_text[m_at] != '\0') ++m_at;
      if (m_at == begin) Fail();
    }
    value.m_raw = m_text.substr(begin, m_at - begin);
    return value;
  }
  void ReadItems(InspectorJson& value, int depth) {
    const bool isObject = Accept('{');
    if (!isObject) Accept('[');
    value.m_kind = isObject ? InspectorJson::Object : InspectorJson::List;
    const char close = isObject ? '}' : ']';
    if (Accept(close)) return;
    do {
      if (isObject) {
        if (Peek() != '"') Fail();
        value.m_names.push_back(ReadText());
        if (!Accept(':')) Fail();
      }
      value.m_items.push_back(Read(depth + 1));
    } while (Accept(','));
    if (!Accept(close)) Fail();
  }

  xstring ReadText() {
    xstring text;
    ++m_at;
    while (m_at < m_text.size() && m_text[m_at] != '"') {
      const char c = m_text[m_at++];
      if (static_cast<octet_t>(c) < 0x20) Fail();
      if (c == '\\') {
        ReadEscape(text);
      } else {
        text += c;
      }
    }
    if (m_at == m_text.size()) Fail();
    ++m_at;
    return text;
  }
  void ReadEscape(xstring& text) {
    const char c = m_at < m_text.size() ? m_text[m_at++] : '\0';
    constexpr std::string_view kEscapes = "\"\\/bfnrt", kMeanings = "\"\\/\b\f\n\r\t";
    const std::size_t known = c == '\0' ? std::string_view::npos : kEscapes.find(c);
    if (known != std::string_view::npos) {
      text += kMeanings[known];
      return;
    }
    if (c != 'u') Fail();
    uint32 unit = ReadUnit();
    if ((unit & 0xFC00) == 0xD800 && m_text.substr(m_at, 2) == "\\u") {
      const std::size_t back = m_at;
      m_at += 2;
      const uint32 low = ReadUnit();
      if ((low & 0xFC00) == 0xDC00) {
        unit = 0x10000 + ((unit & 0x3FF) << 10) + (low & 0x3FF);
      } else {
        m_at = back;
      }
    }
    AppendUtf8(text, (unit & 0xFFFFF800) == 0xD800 ? 0xFFFD : unit);
  }
  uint32 ReadUnit() {
    uint32 unit = 0;
    char const* const begin = m_text.data() + m_at;
    if (m_at + 4 > m_text.size() || std::from_chars(begin, begin + 4, unit, 16).ptr != begin + 4) Fail();
    m_at += 4;
    return unit;
  }

  std::string_view m_text;
  std::size_t m_at = 0;
  std::size_t m_items = 0;
};

inline InspectorJson InspectorJson::Parse(std::string_view text) { return InspectorJsonReader(text).ReadAll(); }

// The length of the UTF-8 sequence that a text begins with; 0 when it is none.
inline std::size_t InspectorUtf8Length(std::string_view text) {
  const octet_t first = static_cast<octet_t>(text[0]);
  const std::size_t length = first < 0x80   ? 1
                             : first < 0xC2 ? 0
                             : first < 0xE0 ? 2
                             : first < 0xF0 ? 3
                             : first < 0xF5 ? 4
                                            : 0;
  if (length == 0 || length > text.size()) return 0;
  for (std::size_t i = 1; i < length; ++i) {
    if ((static_cast<octet_t>(text[i]) & 0xC0) != 0x80) return 0;
  }
  const octet_t second = length > 1 ? static_cast<octet_t>(text[1]) : 0;
  const bool isBad = (first == 0xE0 && second < 0xA0) || (first == 0xED && second >= 0xA0) ||
                     (first == 0xF0 && second < 0x90) || (first == 0xF4 && second >= 0x90);
  return isBad ? 0 : length;
}

// Writes JSON: commas come by themselves.
class InspectorWriter {
 public:
  InspectorWriter& Open(char bracket) {
    Next();
    m_text += bracket;
    m_isFirst = true;
    return *this;
  }
  InspectorWriter& Close(char bracket) {
    m_text += bracket;
    m_isFirst = false;
    return *this;
  }
  InspectorWriter& Name(std::string_view name) {
    Next();
    PutText(name);
    m_text += ':';
    m_isFirst = true;
    return *this;
  }
  InspectorWriter& Put(std::string_view text) {
    Next();
    PutText(text);
    return *this;
  }
  InspectorWriter& Put(ConstStringZ text) { return Put(std::string_view(text ? text : "")); }
  InspectorWriter& Put(bool value) { return Raw(value ? "true" : "false"); }
  template <typename T, typename = std::enable_if_t<std::is_arithmetic<T>::value && !std::is_same<T, bool>::value>>
  InspectorWriter& Put(T number) {
    if constexpr (std::is_floating_point<T>::value) {
      if (!(number - number == 0)) return Put(vxMakeString(number));  // JSON has no infinity
    }
    return Raw(vxMakeString(+number));
  }
  InspectorWriter& Raw(std::string_view json) {
    Next();
    m_text += json;
    return *this;
  }
  template <typename T>
  InspectorWriter& Member(std::string_view name, T const& value) {
    return Name(name).Put(value);
  }

  std::size_t Size() const { return m_text.size(); }
  xstring Take() {
    m_isFirst = true;
    return std::exchange(m_text, xstring());
  }

 private:
  void Next() {
    if (!std::exchange(m_isFirst, false)) m_text += ',';
  }
  void PutText(std::string_view text) {
    m_text += '"';
    while (!text.empty()) {
      const std::size_t length = InspectorUtf8Length(text);
      const octet_t c = static_cast<octet_t>(text[0]);
      if (length == 0) {
        AppendUtf8(m_text, 0xFFFD);
      } else if (length > 1 || (c >= 0x20 && c != '"' && c != '\\' && c != 0x7F)) {
        m_text += text.substr(0, length);
      } else {
        constexpr char kDigits[] = "0123456789abcdef";
        m_text += "\\u00";
        m_text += kDigits[c >> 4];
        m_text += kDigits[c & 15];
      }
      text.remove_prefix(std::max<std::size_t>(length, 1));
    }
    m_text += '"';
  }

  xstring m_text;
  bool m_isFirst = true;
};

}  // namespace vesk
