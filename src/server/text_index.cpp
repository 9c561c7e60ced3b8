#include "server/text_index.h"

#include <algorithm>

#include "platform/file_names.h"
#include "text/files.h"
#include "text/paths.h"

namespace qrex::server {

namespace {

size_t BytesOf(unsigned char first) {
  if (first < 0xC0) return 1;  // those within a character, too: a text may be anything
  return first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
}

int64_t UnitsOf(size_t bytes) { return bytes == 4 ? 2 : 1; }

}  // namespace

TextIndex::TextIndex(std::string text) : m_text(std::move(text)), m_starts{0} {
  FoldLineEnds(m_text);
  for (size_t end = 0; (end = m_text.find('\n', end)) != std::string::npos;) m_starts.push_back(++end);
}

std::string_view TextIndex::Line(size_t line) const {
  const size_t begin = m_starts[line];
  const size_t end = line + 1 < m_starts.size() ? m_starts[line + 1] - 1 : m_text.size();
  return std::string_view(m_text).substr(begin, end - begin);
}

size_t TextIndex::OffsetOf(Position position, Columns columns) const {
  if (position.line < 0) return 0;
  if (static_cast<size_t>(position.line) >= m_starts.size()) return m_text.size();
  const std::string_view line = Line(static_cast<size_t>(position.line));
  const size_t begin = m_starts[static_cast<size_t>(position.line)];
  const int64_t wanted = std::max<int64_t>(position.column, 0);
  if (columns == Columns::Utf8) return begin + std::min(line.size(), static_cast<size_t>(wanted));
  size_t at = 0;
  for (int64_t units = 0; at < line.size() && units < wanted;) {
    const size_t bytes = BytesOf(static_cast<unsigned char>(line[at]));
    units += UnitsOf(bytes);
    at = std::min(at + bytes, line.size());
  }
  return begin + at;
}

Position TextIndex::PositionOf(size_t offset, Columns columns) const {
  offset = std::min(offset, m_text.size());
  const auto next = std::upper_bound(m_starts.begin(), m_starts.end(), offset);
  const size_t begin = *(next - 1);
  Position position{next - m_starts.begin() - 1, static_cast<int64_t>(offset - begin)};
  if (columns == Columns::Utf8) return position;
  position.column = 0;
  for (size_t at = begin; at < offset;) {
    const size_t bytes = BytesOf(static_cast<unsigned char>(m_text[at]));
    position.column += UnitsOf(bytes);
    at += bytes;
  }
  return position;
}

Position PositionFrom(const Json& json) { return {NumberAt(json, "line"), NumberAt(json, "character")}; }

Json ToJson(Position position) { return {{"line", position.line}, {"character", position.column}}; }

Json RangeJson(const TextIndex& text, size_t begin, size_t end, Columns columns) {
  return {{"start", ToJson(text.PositionOf(begin, columns))}, {"end", ToJson(text.PositionOf(end, columns))}};
}

bool IsWordByte(char c) {
  return c == '_' || (c >= '0' && c <= '9') || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c & 0x80) != 0;
}

WordPlace WordAt(std::string_view text, size_t offset) {
  offset = std::min(offset, text.size());
  size_t begin = offset, end = offset;
  while (begin > 0 && IsWordByte(text[begin - 1])) --begin;
  while (end < text.size() && IsWordByte(text[end])) ++end;
  return {begin, end};
}

// --- Addresses

namespace {

int HexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  return c >= 'A' && c <= 'F' ? c - 'A' + 10 : -1;
}

constexpr std::string_view kScheme = "file://";

}  // namespace

std::string PathOfUri(std::string_view uri) {
  if (!uri.starts_with(kScheme)) return {};
  uri.remove_prefix(kScheme.size());
  const size_t slash = uri.find('/');  // behind the name of a host
  if (slash == std::string_view::npos) return {};
  uri.remove_prefix(slash);
  std::string path;
  for (size_t i = 0; i < uri.size(); ++i) {
    const bool isEscape = uri[i] == '%' && i + 2 < uri.size() && HexValue(uri[i + 1]) >= 0 && HexValue(uri[i + 2]) >= 0;
    path += isEscape ? static_cast<char>(HexValue(uri[i + 1]) * 16 + HexValue(uri[i + 2])) : uri[i];
    if (isEscape) i += 2;
  }
  if (platform::kHasDrives && path.size() > 2 && path[2] == ':') {  // of which editors write either letter
    path.erase(0, 1);
    if (path[0] >= 'a' && path[0] <= 'z') path[0] = static_cast<char>(path[0] - 'a' + 'A');
  }
  return path;
}

std::string UriOfPath(std::string_view path) {
  static constexpr char kDigits[] = "0123456789ABCDEF";
  std::string uri(kScheme);
  if (!DriveOf(path).empty()) uri += '/';
  for (const char c : path) {
    const bool isPlain =
        (IsWordByte(c) && (c & 0x80) == 0) || std::string_view("/-.~").find(c) != std::string_view::npos;
    if (isPlain) {
      uri += c;
    } else {
      const auto byte = static_cast<unsigned char>(c);
      uri += {'%', kDigits[byte >> 4], kDigits[byte & 15]};
    }
  }
  return uri;
}

}  // namespace qrex::server
