#include "driver/where.h"

#include <algorithm>

#include "platform/console.h"
#include "platform/standard_input.h"
#include "text/files.h"
#include "text/paths.h"

namespace qrex {

namespace {

constexpr size_t kMostDigits = 9;
constexpr size_t kLongestPath = 4096;  // with the numbers behind it
constexpr size_t kMostEnds = 8;        // of a path that may hold what looks like the number behind it

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

// The number at `at`, which is moved behind it; 0 where there is none.
int64_t ReadNumber(std::string_view text, size_t& at) {
  size_t end = at;
  int64_t number = 0;
  for (; end < text.size() && IsDigit(text[end]); ++end) {
    if (end - at == kMostDigits) return 0;
    number = number * 10 + (text[end] - '0');
  }
  at = end;
  return number;
}

// Whether a path may go on from the end of this text to the left.
bool EndsInPath(std::string_view text) {
  if (text.empty()) return false;
  const char c = text.back();
  const bool isLetter = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c & 0x80) != 0;
  if (c == 'm') {  // of a colour?
    const size_t begin = text.find_last_not_of("0123456789;", text.size() - 2);
    if (begin != std::string_view::npos && begin > 0 && text[begin] == '[' && text[begin - 1] == '\x1b') return false;
  }
  return isLetter || IsDigit(c) || std::string_view("_-./\\~+").find(c) != std::string_view::npos;
}

// The numbers behind a path that ends at `at`, and where they end.
template <typename Mention>
bool ReadNumbers(std::string_view line, size_t at, Mention& mention) {
  mention.isInParentheses = line[at++] == '(';
  mention.line = ReadNumber(line, at);
  mention.column = 0;
  if (mention.line == 0) return false;
  const char separator = mention.isInParentheses ? ',' : ':';
  size_t behind = at + 1;
  const int64_t column = at < line.size() && line[at] == separator ? ReadNumber(line, behind) : 0;
  if (column != 0) {
    mention.column = column;
    at = behind;
  }
  if (mention.isInParentheses && (at == line.size() || line[at++] != ')')) return false;
  mention.end = at;
  return true;
}

}  // namespace

bool IsPosition(std::string_view argument) {
  const size_t number = argument.find_last_not_of("0123456789");
  return number != std::string_view::npos && number > 0 && argument[number] == ':' && number + 1 < argument.size();
}

PositionFilter::PositionFilter(Workspace& workspace, Follow follow)
    : m_workspace(workspace), m_follow(follow), m_files(workspace) {
  FullPathOf(".", m_folder);
  if (!m_folder.ends_with('/')) m_folder += '/';
  const ConfigSettings& settings = workspace.settings;
  for (const auto& project : workspace.projects) {
    if (follow == Follow::Forth) {
      AddPrefix(project->rootDir, project->rootDir);
    } else if (const ProjectConfig* config = project->FindConfig(settings.config, settings.platform)) {
      AddPrefix(TranslationDirectory(*config), "");
    }
  }
  if (follow == Follow::Back) AddPrefix(settings.exportTranslatedInclude, "");
}

void PositionFilter::AddPrefix(std::string prefix, const std::string& root) {
  if (prefix.empty()) return;
  if (!prefix.ends_with('/')) prefix += '/';
  const auto isSame = [&](const Prefix& known) { return known.text == prefix; };
  if (std::none_of(m_prefixes.begin(), m_prefixes.end(), isSame)) m_prefixes.push_back({std::move(prefix), root, 0});
}

// Each prefix is searched once for each place where it stands, so that long lines take linear time.
std::optional<PositionFilter::Hit> PositionFilter::NextHit(std::string_view line, size_t from) {
  std::optional<Hit> first;
  for (Prefix& prefix : m_prefixes) {
    if (from == 0 || prefix.next < from) prefix.next = line.find(prefix.text, from);
    const bool isNext = prefix.next != std::string_view::npos && (!first || prefix.next < first->begin);
    if (isNext) first = {prefix.next, prefix.next + prefix.text.size(), &prefix.root};
  }
  return first;
}

// Takes what stands ahead of the prefix and belongs to the path; false where that leads elsewhere.
bool PositionFilter::BeginsPath(std::string_view line, size_t prefix, Mention& mention) const {
  mention.begin = prefix;
  const std::string_view ahead = line.substr(0, prefix);
  mention.isAbsolute = !IsAbsolutePath(line.substr(prefix)) && ahead.ends_with(m_folder);
  if (mention.isAbsolute) {
    mention.begin -= m_folder.size();
  } else if (ahead.ends_with("./") && !ahead.ends_with("../")) {
    mention.begin -= 2;
  }
  return !EndsInPath(line.substr(0, mention.begin));
}

bool PositionFilter::Follows(std::string_view line, const Hit& hit, Mention& mention, FollowedPlace& place) {
  if (!BeginsPath(line, hit.begin, mention)) return false;
  line = line.substr(0, hit.pathBegin + kLongestPath);
  size_t end = hit.pathBegin;
  for (size_t tried = 0; tried < kMostEnds; ++tried, ++end) {
    end = line.find_first_of(":(\"*<>?|", end);
    if (end == std::string_view::npos || (line[end] != ':' && line[end] != '(')) return false;
    if (end + 1 == line.size() || !IsDigit(line[end + 1]) || !ReadNumbers(line, end, mention)) continue;
    const std::string file = CollapseDots(line.substr(hit.pathBegin, end - hit.pathBegin));
    if (m_follow == Follow::Back) {
      if (m_files.Back(file, mention.line, mention.column, place)) return true;
      continue;
    }
    const ProjectFile* const known = m_workspace.FindFile(file);
    if (!known || known->project->rootDir != *hit.root) continue;
    if (m_files.Forth(file, mention.line, mention.column, place)) return true;
  }
  return false;
}

std::string PositionFilter::Printed(const Mention& mention, const FollowedPlace& place) const {
  std::string text = mention.isAbsolute && !IsAbsolutePath(place.path) ? m_folder + place.path : place.path;
  text.append(mention.isInParentheses ? "(" : ":").append(std::to_string(place.line));
  if (mention.column != 0) text.append(mention.isInParentheses ? "," : ":").append(std::to_string(place.column));
  return mention.isInParentheses ? text + ")" : text;
}

std::optional<std::string> PositionFilter::Rewritten(std::string_view line) {
  std::optional<std::string> text;
  size_t copied = 0;
  bool isStale = false;
  for (size_t from = 0; const auto hit = NextHit(line, from);) {
    Mention mention;
    FollowedPlace place;
    from = hit->begin + 1;
    if (!Follows(line, *hit, mention, place)) continue;
    if (!text) text.emplace();
    text->append(line.substr(copied, mention.begin - copied)).append(Printed(mention, place));
    from = copied = mention.end;
    isStale = isStale || place.isStale;
  }
  if (!text) return text;
  text->append(line.substr(copied));
  if (isStale) text->insert(text->ends_with('\r') ? text->size() - 1 : text->size(), " (stale)");
  return text;
}

std::string PositionFilter::WithLinesFollowed(std::string_view lines) {
  std::string text;
  text.reserve(lines.size());
  while (!lines.empty()) {
    const size_t end = std::min(lines.find('\n'), lines.size());
    const std::string_view line = lines.substr(0, end);
    if (const auto rewritten = Rewritten(line)) {
      text += *rewritten;
    } else {
      text += line;
    }
    if (end < lines.size()) text += '\n';
    lines.remove_prefix(std::min(end + 1, lines.size()));
  }
  return text;
}

void PositionFilter::Run() {
  std::string bytes;
  for (size_t searched = 0; platform::ReadStdin(bytes); searched = bytes.size()) {
    const size_t end = bytes.rfind('\n');
    if (end == std::string::npos || end < searched) continue;
    platform::WriteStdout(WithLinesFollowed(std::string_view(bytes).substr(0, end + 1)));
    bytes.erase(0, end + 1);
  }
  platform::WriteStdout(WithLinesFollowed(bytes));
}

}  // namespace qrex
