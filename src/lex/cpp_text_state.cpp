#include "lex/cpp_text_state.h"

#include <algorithm>

namespace qrex {

namespace {

bool StandsInWord(char c) {
  return c == '_' || (c >= '0' && c <= '9') || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c & 0x80) != 0;
}

constexpr size_t kWordKept = 4;       // the longest prefix of a literal has 3
constexpr size_t kDirectiveKept = 8;  // the longest word that is asked for has 7

bool IsRawPrefix(std::string_view word) {
  return word == "R" || word == "LR" || word == "uR" || word == "UR" || word == "u8R";
}

bool StartsWith(std::string_view text, std::string_view prefix) { return text.substr(0, prefix.size()) == prefix; }

}  // namespace

bool CppTextState::MayBreakBehind() const { return m_previous == ';' || m_previous == '{' || m_previous == '}'; }

void CppTextState::MoveLineNumber() {
  m_isLineNumberKnown = true;
  if (!m_branches.empty()) m_branches.back().movedLineNumber = true;
}

void CppTextState::Pass(char c) {
  const bool isSpliced = c == '\n' && m_previous == '\\';
  switch (m_within) {
    case Within::Code:
      PassCode(c);
      break;
    case Within::LineComment:
      if (c == '\n' && !isSpliced) m_within = Within::Code;
      break;
    case Within::BlockComment:
      if (c == '/' && m_previous == '*') {
        m_within = Within::Code;
        c = ' ';  // begins no other comment
      }
      break;
    case Within::Literal:
      if (m_isEscaped) {
        m_isEscaped = false;
      } else if (c == '\\') {
        m_isEscaped = true;
      } else if (c == m_quote || c == '\n') {  // in text that is no code an apostrophe may stand alone
        m_within = Within::Code;
      }
      break;
    default:
      PassRaw(c);
      break;
  }
  if (c == '\n' && m_within == Within::Code && !isSpliced) EndLine();
  m_previous = c;
}

void CppTextState::PassCode(char c) {
  if (c == '#' && m_atLineStart && !m_inDirective) {
    m_inDirective = true;
    m_directive.clear();
  } else if (m_inDirective && m_directive.size() < kDirectiveKept && c != ' ' && c != '\t') {
    m_directive += c;
  }
  const bool isBlank = c == ' ' || c == '\t' || c == '\n' || c == '\r';
  if (!isBlank) m_atLineStart = false;
  if (c == '"' || c == '\'') {
    PassQuote(c);
  } else if (m_previous == '/' && (c == '/' || c == '*')) {
    m_within = c == '/' ? Within::LineComment : Within::BlockComment;
  } else if (!m_inDirective) {
    PassBracket(c);
  }
  if (!StandsInWord(c)) return m_word.clear();
  if (m_word.size() < kWordKept) m_word += c;
}

void CppTextState::PassQuote(char c) {
  const bool isSeparator = c == '\'' && !m_word.empty() && m_word[0] >= '0' && m_word[0] <= '9';
  if (isSeparator) return;
  if (c == '"' && IsRawPrefix(m_word)) {
    m_within = Within::RawDelimiter;
    m_raw = ")";
    m_rawMatched = 0;
    return;
  }
  m_within = Within::Literal;
  m_quote = c;
  m_isEscaped = false;
}

// A `}` leads back to where its `{` stood, and so do the branches of a condition, whatever they leave open.
void CppTextState::PassBracket(char c) {
  if (c == '(') {
    ++m_parentheses;
  } else if (c == ')') {
    if (m_parentheses > 0) --m_parentheses;
  } else if (c == '{') {
    m_braces.push_back(m_parentheses);
  } else if (c == '}' && !m_braces.empty()) {
    m_parentheses = m_braces.back();
    m_braces.pop_back();
  }
}

void CppTextState::PassRaw(char c) {
  constexpr size_t kLongestEnd = 18;  // of a raw string: a delimiter has 16 characters at most
  if (m_within == Within::RawDelimiter) {
    if (c == '(' || m_raw.size() >= kLongestEnd) {
      m_within = Within::RawString;
      c = '"';
    }
    m_raw += c;
    return;
  }
  if (c != m_raw[m_rawMatched]) m_rawMatched = 0;  // a `)` stands at its begin alone
  if (c == m_raw[m_rawMatched]) ++m_rawMatched;
  if (m_rawMatched == m_raw.size()) m_within = Within::Code;
}

void CppTextState::EndLine() {
  m_atLineStart = true;
  m_word.clear();
  if (m_inDirective) EndDirective();
}

void CppTextState::EndDirective() {
  m_inDirective = false;
  const std::string_view word = m_directive;
  if (StartsWith(word, "if")) {
    m_branches.push_back({m_parentheses});
  } else if (StartsWith(word, "line") || (!word.empty() && word[0] >= '0' && word[0] <= '9')) {
    MoveLineNumber();
    m_isLineNumberKnown = false;
  } else if (!m_branches.empty() && (StartsWith(word, "el") || StartsWith(word, "endif"))) {
    const Branch branch = m_branches.back();
    if (branch.movedLineNumber) m_isLineNumberKnown = false;
    if (StartsWith(word, "el")) {
      m_parentheses = branch.parentheses;
      return;
    }
    m_branches.pop_back();
    if (branch.movedLineNumber && !m_branches.empty()) m_branches.back().movedLineNumber = true;
  }
}

}  // namespace qrex
