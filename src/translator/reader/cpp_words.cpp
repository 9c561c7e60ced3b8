#include "translator/reader/cpp_words.h"

namespace qrex {

namespace {

constexpr std::string_view kNamedType = "a declaration names its type: write it out, ahead of the name";
constexpr std::string_view kAhead = "write it ahead of the $ of a member or function, where it is plain text";
constexpr std::string_view kBehind =
    "behind the parameters of what is called by name or through a handle stands const at most: leave it out";
constexpr std::string_view kInitialiser = "initialise it in a constructor, as in $$() : x(1) {}";

struct Advice {
  std::string_view word;
  std::string_view advice;
  std::string_view message;  // how the error begins; empty: in any way
};
constexpr Advice kAdvice[] = {
    {"auto", kNamedType, {}},
    {"decltype", kNamedType, {}},
    {"->", kNamedType, {}},
    {"constexpr", kAhead, {}},
    {"consteval", kAhead, {}},
    {"constinit", kAhead, {}},
    {"static", kAhead, {}},
    {"virtual", kAhead, {}},
    {"inline", kAhead, {}},
    {"explicit", kAhead, {}},
    {"[[", kAhead, {}},
    {"noexcept", kBehind, {}},
    {"override", kBehind, {}},
    {"final", kBehind, {}},
    {"&&", "write a reference to const, or a value", {}},
    {"struct", "an enumeration with a scope of its own is $enum class", "Expected { after struct"},
    {"=", kInitialiser, "; expected after field declaration"},
    {"{", kInitialiser, "; expected after field declaration"},
    {"=", "leave it out: a handle has no bodies of its own", "Expected ; after"},
};

}  // namespace

void AdviseOnCppWord(const TextRange& text, LexScannerException& exception) {
  if (!exception.position || !text.Contains(exception.position)) return;
  const std::string_view rest(exception.position, text.end);
  for (const Advice& row : kAdvice) {
    if (!rest.starts_with(row.word) || !exception.message.starts_with(row.message)) continue;
    const bool isWord = IsIdentifierPart(row.word.back());
    if (isWord && rest.size() > row.word.size() && IsIdentifierPart(rest[row.word.size()])) continue;
    exception.message.append("\n    ").append(row.word).append(": ").append(row.advice);
    return;
  }
}

}  // namespace qrex
