#include "translator/file/position_map.h"

#include <algorithm>

#include "lex/scanner.h"
#include "text/files.h"
#include "text/payload.h"
#include "text/text_writer.h"

namespace qrex {

namespace {

constexpr uint32_t kMagic = 0x2AEF78F5;

// Files on the disk have CR LF where those in memory have LF.
uint32_t PrintOf(std::string_view text) {
  std::string folded(text);
  FoldLineEnds(folded);
  return Crc32(folded);
}

// The tokens of a text with their lines.
class LinedTokens {
 public:
  LinedTokens(std::string_view text, Dialect dialect) : m_scanner(text, dialect), m_counted(text.data()) {}
  LexToken Next() { return NextToken(m_scanner); }
  int64_t LineOf(const char* position) {  // positions increase
    m_line += std::count(m_counted, position, '\n');
    m_counted = position;
    return m_line;
  }

 private:
  LexScanner m_scanner;
  const char* m_counted;
  int64_t m_line = 1;
};

// By line of `other`, from 1 on, the line of `text` that holds the first token which begins there; 0 where none does,
// or where the tokens differ.
std::vector<int64_t> LinesOfTokens(std::string_view other, std::string_view text, Dialect dialect) {
  std::vector<int64_t> lines(static_cast<size_t>(CountLines(other)) + 1);
  LinedTokens mine(other, dialect), theirs(text, dialect);
  try {
    for (;;) {
      const LexToken token = mine.Next(), same = theirs.Next();
      if (token.kind == kEndOfText || token.kind != same.kind || !(token.text == same.text)) break;
      int64_t& line = lines[static_cast<size_t>(mine.LineOf(token.text.begin))];
      const int64_t theirLine = theirs.LineOf(same.text.begin);
      if (line == 0) line = theirLine;
    }
  } catch (const LexScannerException&) {  // what is behind here is no C++ that the scanner accepts
  }
  return lines;
}

}  // namespace

int64_t CountLines(std::string_view text) {
  const auto ends = std::count(text.begin(), text.end(), '\n');
  return ends + (text.empty() || text.back() == '\n' ? 0 : 1);
}

void PositionMap::Add(int64_t line, std::string_view path, int64_t sourceLine) {
  if (!m_runs.empty() && m_paths[m_runs.back().path] == path) {
    Run& run = m_runs.back();
    if (line == run.begin + 1) run.advances = run.line != 0 && sourceLine == run.line + 1;
    if (sourceLine == run.line + (run.advances ? line - run.begin : 0)) return;
  }
  auto known = std::find(m_paths.begin(), m_paths.end(), path);
  if (known == m_paths.end()) known = m_paths.insert(known, std::string(path));
  m_runs.push_back({line, static_cast<uint32_t>(known - m_paths.begin()), sourceLine, sourceLine != 0});
}

PositionMap PositionMap::OfTranslation(const ScannedFile& file, std::string_view text) {
  PositionMap map;
  MemoryTextWriter ignored;
  const int64_t count = CountLines(text);
  for (int64_t line = 1; line <= count; ++line) {
    std::string path;
    int64_t sourceLine = 0;
    const bool isFound = file.MapGeneratedLine(line, ignored, path, sourceLine);
    map.Add(line, isFound ? path : file.SourcePath(), isFound ? sourceLine : 0);
  }
  if (map.m_runs.empty()) map.Add(1, file.SourcePath(), 0);
  return map;
}

PositionMap PositionMap::OfCopy(const std::string& sourcePath) {
  PositionMap map;
  map.Add(1, sourcePath, 1);
  return map;
}

PositionMap PositionMap::RealignedTo(std::string_view other, std::string_view text, Dialect dialect) const {
  PositionMap map;
  const std::vector<int64_t> lines = LinesOfTokens(other, text, dialect);
  const int64_t last = CountLines(text);
  int64_t next = 1;  // of the lines without a token, which follow the last one with one
  for (size_t line = 1; line < lines.size(); ++line) {
    const int64_t same = lines[line] != 0 ? lines[line] : std::min(next, last);
    const SourceLineView source = Find(same);
    map.Add(static_cast<int64_t>(line), source.path, source.line);
    next = same + 1;
  }
  if (map.m_runs.empty()) return *this;
  return map;
}

SourceLineView PositionMap::Find(int64_t line) const {
  const auto isBehind = [](int64_t number, const Run& run) { return number < run.begin; };
  auto run = std::upper_bound(m_runs.begin() + 1, m_runs.end(), line, isBehind) - 1;
  return {m_paths[run->path], run->line + (run->advances ? std::max<int64_t>(line - run->begin, 0) : 0)};
}

// --- On the disk: the print of the text, then paths and runs, each with their number ahead.

void PositionMap::Save(const std::string& textPath, std::string_view text) const {
  std::string payload;
  AppendNumber(payload, PrintOf(text), sizeof(uint32_t));
  AppendCompactLength(payload, m_paths.size());
  for (const std::string& path : m_paths) AppendCompactString(payload, path);
  AppendCompactLength(payload, m_runs.size());
  for (const Run& run : m_runs) {
    AppendCompactLength(payload, static_cast<uint64_t>(run.begin));
    AppendCompactLength(payload, run.path);
    AppendCompactLength(payload, static_cast<uint64_t>(run.line) << 1 | (run.advances ? 1 : 0));
  }
  WriteCheckedFile(kMagic, payload, PathFor(textPath));
}

std::optional<PositionMap> PositionMap::Load(const std::string& textPath, std::string_view text) {
  std::string payload;
  if (!ReadCheckedFile(kMagic, payload, PathFor(textPath))) return std::nullopt;
  PositionMap map;
  try {
    PayloadReader reader(payload);
    if (reader.Number(sizeof(uint32_t)) != PrintOf(text)) return std::nullopt;
    for (uint64_t count = reader.Length(); count > 0; --count) map.m_paths.emplace_back(reader.String());
    for (uint64_t count = reader.Length(); count > 0; --count) {
      Run& run = map.m_runs.emplace_back();
      run.begin = static_cast<int64_t>(reader.Length());
      run.path = static_cast<uint32_t>(reader.Length());
      const uint64_t line = reader.Length();
      run.line = static_cast<int64_t>(line >> 1);
      run.advances = (line & 1) != 0;
      if (run.path >= map.m_paths.size()) return std::nullopt;
    }
  } catch (const DeserialisationException&) {
    return std::nullopt;
  }
  if (map.m_runs.empty()) return std::nullopt;
  return map;
}

}  // namespace qrex
