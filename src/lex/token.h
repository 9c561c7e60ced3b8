// Positions, tokens and the scanning error. A token is a kind and a pair of positions into a text that outlives it:
// scanning copies and allocates nothing, and an error needs to carry only a position (file and line are worked out when
// printed).
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <string>
#include <string_view>

#include "text/exceptions.h"
#include "text/message.h"

namespace qrex {

struct TextRange {
  const char* begin = nullptr;
  const char* end = nullptr;

  TextRange() = default;
  TextRange(const char* begin, const char* end) : begin(begin), end(end) {}
  explicit TextRange(std::string_view text) : begin(text.data()), end(text.data() + text.size()) {}

  bool Empty() const { return begin >= end; }
  size_t Size() const { return begin < end ? static_cast<size_t>(end - begin) : 0; }
  std::string_view View() const { return {begin, Size()}; }
  std::string Text() const { return std::string(View()); }
  bool Contains(const char* position) const { return begin <= position && position <= end; }  // both ends inside

  friend bool operator==(const TextRange& a, const TextRange& b) { return a.View() == b.View(); }
  friend bool operator==(const TextRange& a, std::string_view b) { return a.View() == b; }
  friend bool operator<(const TextRange& a, const TextRange& b) { return a.View() < b.View(); }
};

// The codes are fixed. An opening bracket's code plus one is its closing bracket's.
enum TokenKind : int32_t {
  kNoToken = -1,
  kEndOfText = 10000,
  kComment = 10001,
  kMacroComment = 10002,  // @// or @/* */
  kDecimal = 10003,
  kHex = 10004,
  kFloat = 10005,
  kSingleQuoted = 10006,
  kDoubleQuoted = 10007,
  kIdentifier = 10008,
  kLess = 10009,
  kGreater,
  kAnd,
  kOr,
  kXor,
  kLessEqual = 10014,
  kGreaterEqual,
  kAndAssign,
  kOrAssign,
  kXorAssign,
  kShiftLeft = 10019,
  kShiftRight,
  kAndAnd,
  kOrOr,
  kXorXor,
  kShiftLeftAssign = 10024,
  kShiftRightAssign,
  kAndAndAssign,
  kOrOrAssign,
  kXorXorAssign,
  kPlus = 10029,
  kMinus,
  kStar,
  kSlash,
  kPercent,
  kNot,
  kAssign,
  kQuestion,
  kPlusPlus = 10037,
  kMinusMinus,
  kPlusAssign = 10039,
  kMinusAssign,
  kStarAssign,
  kSlashAssign,
  kPercentAssign,
  kNotEqual,
  kEqual,
  kQuestionAssign,
  kArrow = 10047,
  kColon,
  kColonColon,
  kDollar,
  kDollarDollar,
  kDot = 10052,
  kComma,
  kSemicolon,
  kOpenParen,
  kCloseParen,
  kOpenBrace,
  kCloseBrace,
  kOpenBracket,
  kCloseBracket,
  kTilde = 10061,
  kAt,
  kBackslash,
  kBackquote,
  kHash,
  // Of C++ text alone.
  kRawString,
  kStray,  // what belongs to no token: a byte, or the rest of a line behind a quote that is not closed there
};

// Of each byte the kind of the token that it is by itself.
inline constexpr auto kOneByteTokens = [] {
  constexpr std::string_view kBytes = "<>&|^+-*/%!=?:$.,;(){}[]~@\\`#";
  constexpr TokenKind kKinds[] = {kLess,      kGreater,    kAnd,       kOr,         kXor,         kPlus,
                                  kMinus,     kStar,       kSlash,     kPercent,    kNot,         kAssign,
                                  kQuestion,  kColon,      kDollar,    kDot,        kComma,       kSemicolon,
                                  kOpenParen, kCloseParen, kOpenBrace, kCloseBrace, kOpenBracket, kCloseBracket,
                                  kTilde,     kAt,         kBackslash, kBackquote,  kHash};
  static_assert(kBytes.size() == std::size(kKinds));
  std::array<int32_t, 256> kinds{};
  for (int32_t& kind : kinds) kind = kNoToken;
  for (size_t i = 0; i < kBytes.size(); ++i) kinds[static_cast<unsigned char>(kBytes[i])] = kKinds[i];
  return kinds;
}();
inline int32_t OneByteToken(char c) { return kOneByteTokens[static_cast<unsigned char>(c)]; }

struct LexToken {
  int32_t kind = kNoToken;
  TextRange text;  // exact source text, quotes and prefix included
  bool Is(std::string_view word) const { return text == word; }
};

// A token in a message: its source text, "EOS" when empty.
std::string Printed(const LexToken& token);

class LexScannerException : public IException {
 public:
  LexScannerException(std::string message, const char* position) : message(std::move(message)), position(position) {}
  LexScannerException(std::string message, const TextRange& range)
      : LexScannerException(std::move(message), range.begin) {}
  LexScannerException(std::string message, const LexToken& token)
      : LexScannerException(std::move(message), token.text.begin) {}

  void Write(TextWriter& writer) const override;  // file(line) : error : message
  virtual const char* Message() const { return message.c_str(); }
  LexScannerException& WithHint(std::string text) {
    hint = std::move(text);
    return *this;
  }

  void SetPlace(const SourcePlace& place) {
    file = place.file;
    line = place.line;
    begin = place.begin;
    end = place.end;
  }
  std::string message;  // enclosing contexts append to it and patch it on the way out
  std::string hint;     // what a terminal shows behind the message
  std::string file;     // empty until located
  int64_t line = -1;
  int64_t begin = -1, end = -1;  // bytes in the file's text
  const char* position;
};

}  // namespace qrex
