// What is JSON, and its tokens.

@import "Vesk/vxObject/src/json_scanner.h"

namespace vesk {

void JsonScanner::FailAt(std::size_t position, std::string const& what) const {
  position = std::min(position, m_text.size());
  const std::string_view before = m_text.substr(0, position);
  const std::size_t line = 1 + std::count(before.begin(), before.end(), '\n');
  const std::size_t column = position - (before.rfind('\n') + 1) + 1;
  throw JsonError(vxMakeString("line " << line << ", column " << column << ": " << what));
}

void JsonScanner::Check(int depth) {
  xvector<Level> levels;
  bool isValueNext = true;
  do {
    const char c = Peek();
    if (isValueNext) {
      if (c == '[' || c == '{') {
        if (levels.size() >= static_cast<std::size_t>(std::max(depth, 0))) Fail("nested too deeply");
        levels.push_back({c == '[' ? ']' : '}', m_position++, 0});
        if (Peek() != levels.back().m_close) {
          if (c == '{') CheckName();
          continue;
        }
        ++m_position;
        levels.pop_back();
      } else {
        CheckScalar();
      }
      isValueNext = false;
    } else {
      Level& level = levels.back();
      ++level.m_count;
      if (c == ',') {
        ++m_position;
        if (level.m_close == '}') CheckName();
        isValueNext = true;
      } else if (c == level.m_close) {
        if (c == ']') m_counts[level.m_begin] = level.m_count;
        ++m_position;
        levels.pop_back();
      } else {
        Fail(std::string("expected , or ") + level.m_close);
      }
    }
  } while (isValueNext || !levels.empty());
  if (Peek() || m_position < m_text.size()) Fail("text behind the value");
  m_position = 0;
}

void JsonScanner::CheckName() {
  if (Peek() != '"') Fail("expected a name");
  CheckString();
  Expect(':');
}

void JsonScanner::CheckScalar() {
  const char c = Peek();
  if (c == '"') return CheckString();
  if (c == '-' || IsDigit(c)) return CheckNumber();
  if (!AcceptWord("null") && !AcceptWord("true") && !AcceptWord("false")) Fail("expected a value");
}

void JsonScanner::CheckString() {
  const std::size_t begin = m_position++;
  for (;;) {
    if (m_position == m_text.size()) FailAt(begin, "string without an end");
    const char c = m_text[m_position];
    if (c == '"') break;
    if (static_cast<octet_t>(c) < 0x20) Fail("control character in a string");
    const std::size_t length = Utf8Length(m_text.substr(m_position));
    if (length == 0) Fail("text is not UTF-8");
    m_position += length;
    if (c == '\\') CheckEscape();
  }
  ++m_position;
}

void JsonScanner::CheckEscape() {
  constexpr std::string_view escapes = "\"\\/bfnrtu";
  const char c = m_position < m_text.size() ? m_text[m_position] : '\0';
  if (!c || escapes.find(c) == std::string_view::npos) Fail("unknown escape");
  ++m_position;
  if (c == 'u') Hex4();
}

void JsonScanner::CheckDigits() {
  if (m_position == m_text.size() || !IsDigit(m_text[m_position])) Fail("expected a digit");
  while (m_position < m_text.size() && IsDigit(m_text[m_position])) ++m_position;
}

void JsonScanner::CheckNumber() {
  auto next = [this] { return m_position < m_text.size() ? m_text[m_position] : '\0'; };
  if (next() == '-') ++m_position;
  const std::size_t begin = m_position;
  CheckDigits();
  if (m_text[begin] == '0' && m_position > begin + 1) FailAt(begin, "number with a leading zero");
  if (next() == '.') {
    ++m_position;
    CheckDigits();
  }
  if (next() == 'e' || next() == 'E') {
    ++m_position;
    if (next() == '+' || next() == '-') ++m_position;
    CheckDigits();
  }
}

uint32 JsonScanner::Hex4() {
  uint32 value = 0;
  for (int i = 0; i < 4; ++i, ++m_position) {
    const char c = m_position < m_text.size() ? m_text[m_position] : '\0';
    const char lower = c >= 'A' && c <= 'F' ? static_cast<char>(c + 32) : c;
    const std::size_t digit = lower ? std::string_view(kHexDigits).find(lower) : std::string_view::npos;
    if (digit == std::string_view::npos) Fail("expected four hexadecimal digits");
    value = value << 4 | static_cast<uint32>(digit);
  }
  return value;
}

std::u16string JsonScanner::ReadString16() {
  if (Peek() != '"') Fail("expected a string");
  std::u16string text;
  for (++m_position; m_text[m_position] != '"';) {
    const char c = m_text[m_position];
    if (c != '\\') {
      const std::size_t length = Utf8Length(m_text.substr(m_position));
      uint32 point = length == 1 ? c : static_cast<octet_t>(c) & (0x7F >> length);
      for (std::size_t i = 1; i < length; ++i)
        point = point << 6 | (static_cast<octet_t>(m_text[m_position + i]) & 0x3F);
      m_position += length;
      if (point >= 0x10000) text += static_cast<char16>(0xD7C0 + (point >> 10));
      text += static_cast<char16>(point >= 0x10000 ? 0xDC00 | (point & 0x3FF) : point);
      continue;
    }
    const char escape = m_text[m_position + 1];
    m_position += 2;
    constexpr std::string_view from = "bfnrt", to = "\b\f\n\r\t";
    const std::size_t at = from.find(escape);
    text += escape == 'u' ? static_cast<char16>(Hex4()) : at == std::string_view::npos ? escape : to[at];
  }
  ++m_position;
  return text;
}

std::string JsonScanner::ReadString8() {
  const std::size_t begin = m_position;
  const std::u16string units = ReadString16();
  for (std::size_t i = 0; i < units.size(); ++i) {
    if ((units[i] & 0xF800) != 0xD800) continue;
    const bool isPair = (units[i] & 0xFC00) == 0xD800 && i + 1 < units.size() && (units[i + 1] & 0xFC00) == 0xDC00;
    if (!isPair) FailAt(begin, "lone surrogate in a string of UTF-8");
    ++i;
  }
  return Utf8Text(units);
}

std::string_view JsonScanner::ReadNumber() {
  const char c = Peek();
  if (c != '-' && !IsDigit(c)) Fail("expected a number");
  const std::size_t begin = m_position;
  CheckNumber();
  return m_text.substr(begin, m_position - begin);
}

void JsonScanner::SkipValue() {
  int depth = 0;
  do {
    const char c = Peek();
    if (c == '[' || c == '{') {
      ++depth;
      ++m_position;
    } else if (c == ']' || c == '}') {
      --depth;
      ++m_position;
    } else if (c == ',' || c == ':') {
      ++m_position;
    } else {
      CheckScalar();
    }
  } while (depth > 0);
}

}  // namespace vesk
