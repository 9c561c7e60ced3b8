// The text of JSON, token by token. Check reads all of it once: what follows meets only well-formed text, and knows how
// many elements each array has.

@import "Vesk/vxObject/JsonText.h"

namespace vesk {

class JsonScanner {
 public:
  explicit JsonScanner(std::string_view text) : m_text(text) {}

  // Throws JsonError for what is no JSON, no UTF-8, or deeper than `depth`. Uses no stack of its own for depth.
  void Check(int depth);

  // Where the next token begins.
  std::size_t Here() {
    SkipBlanks();
    return m_position;
  }
  void GoTo(std::size_t position) { m_position = position; }

  // The first character of the next token; 0 at the end.
  char Peek() { return Here() < m_text.size() ? m_text[m_position] : '\0'; }
  bool Accept(char c) {
    if (Peek() != c) return false;
    ++m_position;
    return true;
  }
  bool AcceptNull() { return AcceptWord("null"); }
  bool AcceptWord(std::string_view word) {
    if (Peek() != word[0] || m_text.substr(m_position, word.size()) != word) return false;
    m_position += word.size();
    return true;
  }
  void Expect(char c) {
    if (!Accept(c)) Fail(std::string("expected ") + c);
  }
  // Of the array that begins here.
  ssize_t CountHere() {
    const auto at = m_counts.find(Here());
    return at == m_counts.end() ? 0 : at->second;
  }
  // A string as units of UTF-16, in which a surrogate may stand alone, or as UTF-8, in which it must not.
  std::u16string ReadString16();
  std::string ReadString8();
  // The characters of a number.
  std::string_view ReadNumber();
  void SkipValue();

  // At the token that comes next, or at a position.
  [[noreturn]] void Fail(std::string const& what) { FailAt(m_position, what); }
  [[noreturn]] void FailAt(std::size_t position, std::string const& what) const;

 private:
  struct Level {
    char m_close;
    std::size_t m_begin;
    ssize_t m_count;
  };

  void SkipBlanks() {
    while (m_position < m_text.size() && IsBlank(m_text[m_position])) ++m_position;
  }
  static bool IsBlank(char c) { return c == ' ' || c == '\n' || c == '\t' || c == '\r'; }
  static bool IsDigit(char c) { return c >= '0' && c <= '9'; }

  void CheckScalar();
  void CheckName();
  void CheckString();
  void CheckEscape();
  void CheckNumber();
  void CheckDigits();
  uint32 Hex4();

  std::string_view m_text;
  std::size_t m_position = 0;
  std::unordered_map<std::size_t, ssize_t> m_counts;  // of arrays with elements, by where they begin
};

}  // namespace vesk
