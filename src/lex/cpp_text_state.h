// Where in a C++ text whoever writes it stands, byte by byte: whether a line may be broken or joined there, and whether
// a preprocessor line may be put ahead of what comes next.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace qrex {

class CppTextState {
 public:
  void Pass(char c);
  // Outside of comments, literals and preprocessor lines, where line ends are blanks like others.
  bool InCode() const { return m_within == Within::Code && !m_inDirective; }
  bool InParentheses() const { return m_parentheses > 0; }
  bool AtLineStart() const { return m_atLineStart; }  // nothing but blanks ahead on the line
  bool MayBreakBehind() const;                        // without a blank: no token goes on here
  // Compilers pass over directives in branches that are not taken: what has moved the line number in one of them leaves
  // it unknown behind the branch.
  void MoveLineNumber();
  bool IsLineNumberKnown() const { return m_isLineNumberKnown; }

 private:
  enum class Within { Code, LineComment, BlockComment, Literal, RawDelimiter, RawString };
  struct Branch {
    size_t parentheses;
    bool movedLineNumber = false;
  };

  void PassCode(char c);
  void PassQuote(char c);
  void PassBracket(char c);
  void PassRaw(char c);
  void EndLine();
  void EndDirective();

  Within m_within = Within::Code;
  bool m_inDirective = false;
  bool m_atLineStart = true;
  bool m_isLineNumberKnown = true;
  bool m_isEscaped = false;
  char m_previous = '\n';
  char m_quote = 0;
  std::string m_word;       // identifier or number that ends here, as far as it tells what a quote behind it is
  std::string m_raw;        // what ends the raw string
  size_t m_rawMatched = 0;  // of it
  std::string m_directive;  // the begin of the preprocessor line, behind the #
  size_t m_parentheses = 0;
  std::vector<size_t> m_braces;  // how many parentheses were open ahead of each
  std::vector<Branch> m_branches;
};

}  // namespace qrex
