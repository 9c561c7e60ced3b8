// Completion of our words, colours and folds: what a text alone tells.
#include <algorithm>
#include <array>
#include <string>
#include <string_view>

#include "driver/config_keys.h"
#include "macro/directives.h"
#include "server/each_token.h"
#include "server/own_language.h"
#include "text/paths.h"
#include "translator/file/keywords.h"
#include "translator/reader/qualifiers.h"

namespace qrex::server {

namespace {

// Of the completion kinds of the protocol.
constexpr int kKeyword = 14, kProperty = 10;

void AddWord(Json& items, std::string_view word, int kind, std::string_view help = {}) {
  Json item = {{"label", word}, {"kind", kind}};
  if (!help.empty()) item["detail"] = help;
  if (std::find(items.begin(), items.end(), item) == items.end()) items.push_back(std::move(item));
}

// Behind `<<` on the same line, with nothing but words and signs between.
bool IsInQualifiers(std::string_view text, size_t at) {
  while (at > 0) {
    const char c = text[--at];
    if (c == '<') return at > 0 && text[at - 1] == '<';
    if (!IsWordByte(c) && c != ' ' && c != '-') return false;
  }
  return false;
}

constexpr std::string_view kProjectWords[] = {"qrex",    "config", "subproj", "directories", "toolfiles",
                                              "general", "export", "exclude", "src",         "cpp",
                                              "rc",      "link",   "as"};

}  // namespace

Json CompletionInSource(std::string_view text, size_t offset) {
  const size_t begin = WordAt(text, offset).begin;
  const char ahead = begin == 0 ? '\n' : text[begin - 1];
  Json items = Json::array();
  if (ahead == '@') {
    for (const Directive& directive : Directive::All()) AddWord(items, directive.word, kKeyword);
  } else if (ahead == '$') {
    for (const Keyword& keyword : AllKeywords().fileLevel) AddWord(items, keyword.word, kKeyword);
    for (const ClassKeyword& keyword : AllKeywords().classLevel) AddWord(items, keyword.word, kKeyword);
  } else if (IsInQualifiers(text, begin)) {
    for (const QualifierWord& word : QualifierWords()) AddWord(items, word.word, kProperty);
    for (const std::string_view word : {"reflect", "register", "nested"}) AddWord(items, word, kProperty);
  } else {
    return nullptr;
  }
  return items;
}

Json CompletionInProject(const std::string& path, std::string_view text, size_t offset) {
  Json items = Json::array();
  const size_t begin = WordAt(text, offset).begin;
  const char ahead = begin == 0 ? '\n' : text[begin - 1];
  if (ahead == '@') {
    for (const Directive& directive : Directive::All()) AddWord(items, directive.word, kKeyword);
    return items;
  }
  if (HasExtension(path, "qrpj")) {
    for (const std::string_view word : kProjectWords) AddWord(items, word, kKeyword);
    for (const std::string_view word : {"$TARGET_TYPE", "$ROOT_TO_PROJDIR"}) AddWord(items, word, kProperty);
    return items;
  }
  if (HasExtension(path, "qrws")) return items;
  const auto addKeys = [&](const auto& keys) {
    for (const auto& key : keys) AddWord(items, key.word, kProperty, key.help);
  };
  addKeys(kStringKeys);
  addKeys(kBoolKeys);
  addKeys(kNumberKeys);
  addKeys(kListKeys);
  addKeys(kCommandKeys);
  addKeys(kEnvironmentKeys);
  addKeys(kPathVariables);
  addKeys(kModes);
  return items;
}

std::string HoverInProject(const std::string& path, std::string_view text, size_t offset) {
  const WordPlace place = WordAt(text, offset);
  const std::string word(text.substr(place.begin, place.end - place.begin));
  for (const Json& item : CompletionInProject(path, "", 0)) {
    const std::string help = TextAt(item, "detail");
    if (TextAt(item, "label") == word && !help.empty()) return "`" + word + "`: " + help;
  }
  return {};
}

// --- Colours

std::vector<std::string> TokenTypes() { return {"macro", "keyword", "variable"}; }

Json SemanticTokens(const TextIndex& index, Columns columns) {
  Json data = Json::array();
  Position last;
  const std::string& text = index.Text();
  const auto add = [&](size_t begin, size_t end, int type) {
    const Position at = index.PositionOf(begin, columns), behind = index.PositionOf(end, columns);
    const int64_t column = at.line == last.line ? at.column - last.column : at.column;
    for (const int64_t value : {at.line - last.line, column, behind.column - at.column, int64_t{type}, int64_t{0}}) {
      data.push_back(value);
    }
    last = at;
  };
  ForEachToken(text, [&](int32_t kind, size_t begin, size_t end) {
    if ((kind != kAt && kind != kDollar) || end >= text.size()) return end;
    const bool isVariable = kind == kDollar && text[end] == '(';
    const size_t wordBegin = end + (isVariable ? 1 : 0);
    const WordPlace word = WordAt(text, wordBegin);
    if (word.begin != wordBegin || word.end == word.begin) return end;
    const std::string_view name = std::string_view(text).substr(word.begin, word.end - word.begin);
    if (isVariable) {
      add(begin, word.end, 2);
    } else if (kind == kDollar) {
      add(begin, word.end, 1);
    } else if (FindDirective(name)) {
      add(begin, word.end, 0);
    }
    return word.end;
  });
  return data;
}

// --- Folds: what stands in brackets over several lines

Json FoldingRanges(const TextIndex& index) {
  Json ranges = Json::array();
  const std::string& text = index.Text();
  std::vector<size_t> open;
  ForEachToken(text, [&](int32_t kind, size_t begin, size_t end) {
    if (kind == kOpenBrace) open.push_back(begin);
    if (kind != kCloseBrace || open.empty()) return end;
    const int64_t first = index.PositionOf(open.back(), Columns::Utf8).line;
    const int64_t line = index.PositionOf(begin, Columns::Utf8).line;
    open.pop_back();
    if (line > first + 1) ranges.push_back({{"startLine", first}, {"endLine", line - 1}});
    return end;
  });
  return ranges;
}

}  // namespace qrex::server
