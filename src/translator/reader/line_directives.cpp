#include "translator/reader/line_directives.h"

#include <algorithm>
#include <charconv>
#include <cstring>
#include <utility>

namespace qrex {

namespace {

constexpr int64_t kMostEmptyLines = 8;  // in place of a directive
constexpr size_t kBufferSize = 16 << 10;

bool IsHexDigit(char c) { return (c >= '0' && c <= '9') || (c >= 'a' && c <= 'f'); }
bool IsBlank(char c) { return c == ' ' || c == '\n' || c == '\t' || c == '\r' || c == '\f' || c == '\v'; }

}  // namespace

SourceLines::SourceLines(const ScannedFile& file)
    : m_file(file),
      m_source(std::string_view(file.text.source)),
      m_starts(m_source),
      m_path(*m_paths.insert(file.SourcePath()).first) {
  ReadOwnDirectives();
}

// Text that was generated from something else says so.
void SourceLines::ReadOwnDirectives() {
  const std::string_view text = m_source.View();
  const std::string* path = &m_path;
  for (size_t at = 0; (at = text.find("#line ", at)) != text.npos; ++at) {
    if (at > 0 && text[at - 1] != '\n') continue;
    const std::string_view line = text.substr(at, text.find('\n', at) - at);
    int64_t number = 0;
    if (std::from_chars(line.data() + 6, line.data() + line.size(), number).ec != std::errc()) continue;
    const size_t open = line.find('"'), close = line.rfind('"');
    if (open < close) path = &*m_paths.emplace(line.substr(open + 1, close - open - 1)).first;
    m_named[m_starts.LineOf(text.data() + at) + 1] = {path, number, nullptr};
  }
}

bool SourceLines::Find(const char* position, SourceLine& found) {
  if (!position) return false;
  if (m_source.Contains(position)) {
    found = {&m_path, m_starts.LineOf(position), position};
    if (m_named.empty()) return true;
    const auto behind = m_named.upper_bound(found.line);
    if (behind == m_named.begin()) return true;
    const auto& [line, named] = *std::prev(behind);
    found = {named.path, named.line + found.line - line, position};
    return true;
  }
  SourcePlace place;
  if (!m_file.host.FindSourcePlace(position, place)) return false;
  found = {&*m_paths.insert(std::move(place.file)).first, place.line, position};
  return true;
}

const char* SourceLines::EndOfLine(const char* position) const {
  if (!m_source.Contains(position)) return position;
  const void* const lineFeed = std::memchr(position, '\n', static_cast<size_t>(m_source.end - position));
  return lineFeed ? static_cast<const char*>(lineFeed) : m_source.end;
}

ExpandedPlaces::Place ExpandedPlaces::Find(const char* expanded) {
  if (m_expanded.Empty()) return {};
  const int64_t offset = std::min(expanded, m_expanded.end - 1) - m_expanded.begin;
  if (offset < std::exchange(m_last, offset)) {
    m_cursor = MapCursor(m_map);
    m_call = 0;
  }
  const auto& calls = *m_map.calls;
  while (m_call < calls.size() && calls[m_call].end <= offset) ++m_call;
  const bool isBehind = m_call == calls.size();
  if (!isBehind && calls[m_call].begin <= offset) {
    return {calls[m_call].source, m_expanded.begin + calls[m_call].end, false};
  }
  const char* const source = m_cursor.Map(offset);
  const int64_t end = isBehind ? m_cursor.RunEnd() : std::min(m_cursor.RunEnd(), calls[m_call].begin);
  return {source, m_expanded.begin + end, source && m_cursor.IsVerbatim()};
}

LineDirectives::LineDirectives(IOutputStream& target, const ScannedFile& file, std::vector<const char*>& lineTable,
                               TextRange expanded)
    : m_target(target),
      m_lineTable(lineTable),
      m_expanded(expanded),
      m_places(file.text.map, expanded),
      m_markedPlaces(file.text.map, expanded),
      m_lines(file),
      m_copied(expanded.begin) {}

// --- What comes

void LineDirectives::WriteCopied(const char* begin, const char* end) {
  ReleaseMark();
  ReleaseSlash();
  m_inGeneratedComment = false;
  for (const char* at = begin; at < end; ++at) Pass(*at, at);
  m_copied = end;
  m_marked = {};
}

void LineDirectives::WriteGenerated(std::string_view text) {
  for (const char c : text) PassGenerated(c);
}

// A comment would end the line.
void LineDirectives::PassGenerated(char c) {
  if (TakeMark(c)) return;
  if (m_inGeneratedComment && c != '\n') return;
  m_inGeneratedComment = false;
  if (m_heldSlash && c == '/') {
    m_heldSlash = false;
    m_inGeneratedComment = true;
    return;
  }
  ReleaseSlash();
  if (c == '/' && m_state.InCode()) {
    m_heldSlash = true;
  } else {
    Pass(c, nullptr);
  }
}

// The byte of a mark may also be one of a source, with no digits behind it.
bool LineDirectives::TakeMark(char c) {
  if (m_mark && !IsHexDigit(c)) ReleaseMark();
  if (!m_mark) {
    if (c != kPositionMark) return false;
    ReleaseSlash();
    m_mark.emplace();
    return true;
  }
  *m_mark += c;
  if (m_mark->size() == kMarkDigits) m_lines.Find(MarkedPosition(*std::exchange(m_mark, {})), m_marked);
  return true;
}

void LineDirectives::ReleaseMark() {
  if (!m_mark) return;
  for (const char c : kPositionMark + *std::exchange(m_mark, {})) Pass(c, nullptr);
}

void LineDirectives::ReleaseSlash() {
  if (std::exchange(m_heldSlash, false)) Pass('/', nullptr);
}

// `at` is null for generated text.
void LineDirectives::Pass(char c, const char* at) {
  if (m_state.InCode()) {
    if (IsBlank(c)) {
      m_blanks += c;
      return;
    }
    MoveTo(WantedAt(at), c);
  }
  if (m_isLineFresh) {
    m_lineSource = WantedAt(at).position;
    m_isLineFresh = false;
  }
  Put(c);
}

// --- Where it came from

const SourceLine& LineDirectives::WantedAt(const char* at) {
  if (!at && m_marked.path) return m_marked;
  return LineOfExpanded(at ? at : m_copied);
}

const SourceLine& LineDirectives::LineOfExpanded(const char* at) {
  if ((at >= m_holdsFrom && at < m_holdsTo) || m_expanded.Empty()) return m_found;
  const ExpandedPlaces::Place place = m_places.Find(at);
  m_lines.Find(place.source, m_found);
  m_holdsFrom = at;
  m_holdsTo = place.end;
  if (place.isVerbatim) m_holdsTo = std::min(place.end, at + (m_lines.EndOfLine(place.source) - place.source) + 1);
  return m_found;
}

// --- What becomes of it

bool LineDirectives::JoinsLine(const SourceLine& wanted, char next, int64_t lineFeeds) const {
  if (lineFeeds == 0 || next == '#' || m_state.AtLineStart()) return false;
  if (m_state.InParentheses()) return true;
  return wanted.path == m_here.path && wanted.line == m_here.line;
}

bool LineDirectives::PadsTo(const SourceLine& wanted) const {
  if (wanted.path != m_here.path || wanted.line <= m_here.line || !m_state.IsLineNumberKnown()) return false;
  return m_state.InParentheses() || wanted.line - m_here.line <= kMostEmptyLines;
}

// Ahead of what is no blank: the blanks that were held back, and what else it takes.
void LineDirectives::MoveTo(const SourceLine& wanted, char next) {
  const bool isHere = m_state.IsLineNumberKnown() && wanted.path == m_here.path && wanted.line == m_here.line;
  if (isHere && m_blanks.empty()) return;
  const std::string_view blanks = m_blanks;
  const int64_t lineFeeds = std::count(blanks.begin(), blanks.end(), '\n');
  const std::string_view indentation = blanks.substr(blanks.rfind('\n') + 1);
  const bool follows =
      m_state.IsLineNumberKnown() && wanted.path == m_here.path && wanted.line == m_here.line + lineFeeds;
  const bool mayBreak = !blanks.empty() || m_state.AtLineStart() || m_state.MayBreakBehind();
  if (follows || !mayBreak || !wanted.path) {
    PutBlanks(blanks);
  } else if (PadsTo(wanted)) {
    PutBlanks(std::string(static_cast<size_t>(wanted.line - m_here.line), '\n'));
    PutBlanks(indentation);
  } else if (JoinsLine(wanted, next, lineFeeds)) {
    Put(' ');
  } else if (m_state.InParentheses()) {
    PutBlanks(blanks);
  } else {
    if (!m_isLineEmpty) Put('\n');
    WriteDirective(wanted);
    PutBlanks(indentation);
  }
  m_blanks.clear();
}

void LineDirectives::WriteDirective(const SourceLine& wanted) {
  m_output.append("#line ").append(std::to_string(wanted.line)).append(" \"");
  for (const char c : *wanted.path) {
    if (c == '"' || c == '\\') m_output += '\\';
    m_output += c;
  }
  m_output.append("\"\n");
  m_lineTable.push_back(wanted.position);
  m_state.MoveLineNumber();
  m_here = wanted;
}

void LineDirectives::PutBlanks(std::string_view blanks) {
  for (const char c : blanks) Put(c);
}

void LineDirectives::Put(char c) {
  m_state.Pass(c);
  m_output += c;
  m_isLineEmpty = false;
  if (c != '\n') return;
  m_lineTable.push_back(m_lineSource);
  m_isLineFresh = true;
  m_isLineEmpty = true;
  ++m_here.line;
  if (m_output.size() < kBufferSize) return;
  m_target.Write(m_output.data(), m_output.size());
  m_output.clear();
}

void LineDirectives::Finish() {
  ReleaseMark();
  ReleaseSlash();
  PutBlanks(std::exchange(m_blanks, {}));
  m_lineTable.push_back(m_lineSource);
  m_target.Write(m_output.data(), m_output.size());
  m_output.clear();
}

}  // namespace qrex
