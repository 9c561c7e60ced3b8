#include "builder/tool_names.h"

#include <algorithm>

#include "text/numbers.h"

namespace qrex {

std::string Quoted(CompilerKind compiler, std::string_view name) {
  std::string text(name);
  if (IsGccFamily(compiler)) ReplaceAllInPlace(text, "\\", "\\\\");
  return "\"" + text + "\"";
}

namespace {

constexpr std::string_view kBetweenWords = " \t\n\r\v\f";

// A backslash takes the next character as it is, and so do quotes of both kinds, but for a backslash.
std::string TakeGnuWord(std::string_view& text) {
  std::string word;
  char quote = 0;
  size_t at = 0;
  for (; at < text.size(); ++at) {
    const char c = text[at];
    if (c == '\\' && at + 1 < text.size()) {
      word += text[++at];
    } else if (quote != 0) {
      if (c != quote) word += c;
      if (c == quote) quote = 0;
    } else if (c == '"' || c == '\'') {
      quote = c;
    } else if (kBetweenWords.find(c) != std::string_view::npos) {
      break;
    } else {
      word += c;
    }
  }
  text.remove_prefix(at);
  return word;
}

// Backslashes are plain but ahead of a double quote: of 2n and one more the one takes the quote, of 2n it ends or
// begins.
std::string TakeVisualWord(std::string_view& text) {
  std::string word;
  bool isQuoted = false;
  size_t at = 0;
  while (at < text.size()) {
    const size_t behind = std::min(text.find_first_not_of('\\', at), text.size());
    const size_t backslashes = behind - at;
    const bool isAtQuote = behind < text.size() && text[behind] == '"';
    word.append(isAtQuote ? backslashes / 2 : backslashes, '\\');
    at = behind;
    if (at == text.size()) break;
    if (isAtQuote && backslashes % 2 == 0) {
      isQuoted = !isQuoted;
    } else if (!isQuoted && kBetweenWords.find(text[at]) != std::string_view::npos) {
      break;
    } else {
      word += text[at];
    }
    ++at;
  }
  text.remove_prefix(at);
  return word;
}

}  // namespace

std::vector<std::string> ResponseWords(CompilerKind compiler, std::string_view text) {
  std::vector<std::string> words;
  while (true) {
    text.remove_prefix(std::min(text.find_first_not_of(kBetweenWords), text.size()));
    if (text.empty()) return words;
    words.push_back(IsGccFamily(compiler) ? TakeGnuWord(text) : TakeVisualWord(text));
  }
}

namespace {

bool BeginsAnOption(std::string_view path) { return path.starts_with('-') || path.starts_with('@'); }

// What no quoting helps against; empty: nothing.
std::string_view TroubleWith(CompilerKind compiler, std::string_view path) {
  if (path.find_first_of("\n\r") != path.npos) return "a line ends in it";
  if (path.find('"') != path.npos) return "a double quote stands in it";
  if (IsGccFamily(compiler)) return "";
  if (path.find('\\') != path.npos) return "a backslash parts folders there";
  if (BeginsAnOption(path)) return "it would be read as an option";
  return "";
}

}  // namespace

std::string AsInput(CompilerKind compiler, const std::string& path) {
  return IsGccFamily(compiler) && BeginsAnOption(path) ? "./" + path : path;
}

std::string QuotedInput(CompilerKind compiler, const std::string& path) {
  return Quoted(compiler, AsInput(compiler, path));
}

bool ToolsTake(ProjectBuilder& builder, std::initializer_list<std::string_view> paths) {
  for (const std::string_view path : paths) {
    const std::string_view trouble = TroubleWith(builder.settings.compiler, path);
    if (trouble.empty()) continue;
    TraceWriter() << "ERROR: No tool can be given the name " << path << " : " << trouble << "\n";
    ++builder.errorCount;
    return false;
  }
  return true;
}

}  // namespace qrex
