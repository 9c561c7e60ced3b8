#include "macro/source_map.h"

#include <algorithm>
#include <cstring>
#include <utility>

#include "lex/scanner.h"
#include "lex/sections.h"
#include "macro/mpfw_parser.h"
#include "platform/file_system.h"
#include "text/trace.h"

namespace qrex {

namespace {

const char* MapInRun(const SourceMapRun& run, int64_t offsetInRun) {
  return run.IsGenerated() ? run.SourceBegin() : run.SourceBegin() + offsetInRun;
}

[[noreturn]] void FailBeyondEnd() { throw ExceptionBase("INTERNAL ERROR: offset lies beyond the source map"); }

}  // namespace

const char* MapOutputOffset(const SourceMap& map, int64_t offset) {
  MapCursor cursor(map);
  return cursor.Map(offset);
}

void SourceMap::AddPage() {
  const size_t size = PageSize(m_pages.size());
  m_pages.emplace_back(new SourceMapRun[size]);  // not zeroed
  m_next = m_pages.back().get();
  m_pageEnd = m_next + size;
  platform::PreferLargePages(m_next, size * sizeof(SourceMapRun));
}

void SourceMap::AddVerbatim(const char* begin, const char* end) {
  if (begin == end) return;
  if (begin == m_verbatimEnd) {
    SourceMapRun& last = m_next[-1];
    const size_t more = std::min(static_cast<size_t>(end - begin), SourceMapRun::kMostLength - last.Length());
    last.Lengthen(more);
    begin += more;
  }
  for (size_t length; begin < end; begin += length) {
    length = std::min(static_cast<size_t>(end - begin), SourceMapRun::kMostLength);
    Add(begin, length, false);
  }
  m_verbatimEnd = end;
}

void SourceMap::AddGenerated(const char* source, size_t length) {
  m_verbatimEnd = nullptr;
  for (; length > SourceMapRun::kMostLength; length -= SourceMapRun::kMostLength) {
    Add(source, SourceMapRun::kMostLength, true);
  }
  Add(source, length, true);
}

const char* MapCursor::Map(int64_t offset) {
  for (;;) {
    for (; m_run != m_pageEnd; ++m_run) {
      const int64_t length = static_cast<int64_t>(m_run->Length());
      if (offset < m_runBegin + length) return MapInRun(*m_run, offset - m_runBegin);
      m_runBegin += length;
    }
    if (m_nextPage == m_map->PageCount()) FailBeyondEnd();
    m_run = m_map->PageBegin(m_nextPage);
    m_pageEnd = m_map->PageEnd(m_nextPage++);
  }
}

void MapErrorPosition(const SourceMap& map, const TextRange& output, LexScannerException& exception) {
  if (!exception.position || output.Empty() || !output.Contains(exception.position)) return;
  const int64_t last = output.end - output.begin - 1;
  exception.position = MapOutputOffset(map, std::min<int64_t>(exception.position - output.begin, last));
}

bool FindSourcePlace(const SourceFileList& files, const char* position, SourcePlace& place) {
  if (!position) return false;
  for (const auto& file : files) {
    const TextRange text{std::string_view(file->text)};
    // What is missing from an empty expansion has no source of its own: it is missing at the end of the file.
    const bool isEmptyExpansion = file->expansion.empty() && position == file->expansion.data();
    if (!isEmptyExpansion && !text.Contains(position)) continue;
    const char* const begin = isEmptyExpansion ? text.end : position;
    place = {file->path, LineOfPosition(text, begin), begin - text.begin, EndOfWord(text, begin) - text.begin};
    return true;
  }
  return false;
}

bool FindSourceLine(const SourceFileList& files, const char* position, std::string& path, int64_t& line) {
  SourcePlace place;
  if (!FindSourcePlace(files, position, place)) return false;
  path = std::move(place.file);
  line = place.line;
  return true;
}

bool FindExpandedLine(const SourceFileList& files, const char* position, std::string& path, int64_t& line) {
  for (const auto& file : files) {
    const TextRange expansion{std::string_view(file->expansion)};
    if (!position || !expansion.Contains(position)) continue;
    return FindSourceLine(files, MapOutputOffset(file->map, position - expansion.begin), path, line);
  }
  return false;
}

namespace {

// The added line of the command line in which the position lies; empty elsewhere.
std::string_view AddedLine(const SourceFileList& files, const char* position) {
  for (const auto& file : files) {
    const std::string_view text = file->text;
    if (!position || !TextRange(text).Contains(position)) continue;
    const size_t at = static_cast<size_t>(position - text.data());
    if (at < file->addedText) return {};
    const size_t begin = text.rfind('\n', at == 0 ? at : at - 1) + 1;  // the line end itself is of the line it ends
    return text.substr(begin, text.find('\n', at) - begin);
  }
  return {};
}

}  // namespace

bool IsAddedText(const SourceFileList& files, const char* position) {
  for (const auto& file : files) {
    const TextRange expansion{std::string_view(file->expansion)};
    if (!expansion.Contains(position)) continue;
    return !AddedLine(files, MapOutputOffset(file->map, position - expansion.begin)).empty();
  }
  return false;
}

Message ParseErrorOf(const SourceFileList& files, const LexScannerException& exception) {
  Message message = Message(Severity::Error, {}, exception.message).Apart();
  FindSourcePlace(files, exception.position, message.place);
  if (!exception.hint.empty()) message.hints.push_back(exception.hint);
  if (const std::string_view added = AddedLine(files, exception.position); !added.empty()) {
    message.hints.push_back("this line is none of the file, it stands on the command line: " + std::string(added));
  }
  return message;
}

void ExpansionSink::MakeRoom() {
  if (expectedSize > 0) platform::ReserveText(output, std::exchange(expectedSize, 0));
}

void ExpansionSink::AddVerbatim(const char* begin, const char* end) {
  if (begin == end) return;
  MakeRoom();
  output.append(begin, static_cast<size_t>(end - begin));
  map.AddVerbatim(begin, end);
}

// Only a line's begin may need blanks ahead of it.
bool ExpansionSink::BeginsLine(std::string_view text) const {
  return AtLineStart() || std::memchr(text.data(), '\n', text.size()) != nullptr;
}

void ExpansionSink::WriteIndented(const TextRange& range, LineIndent indent) {
  if (range.Empty() || !BeginsLine(range.View())) return AddVerbatim(range.begin, range.end);
  const size_t columns = indent.ColumnsIn(output);
  for (const char* line = range.begin; line < range.end;) {
    if (AtLineStart() && columns > 0) {
      MakeRoom();
      output.append(columns, ' ');
      map.AddGenerated(nullptr, columns);
    }
    const void* lineFeed = std::memchr(line, '\n', static_cast<size_t>(range.end - line));
    const char* const end = lineFeed ? static_cast<const char*>(lineFeed) + 1 : range.end;
    AddVerbatim(line, end);
    line = end;
  }
}

void ExpansionSink::WriteGenerated(std::string_view text, const char* source, LineIndent indent) {
  if (text.empty()) return;
  MakeRoom();
  const size_t before = output.size();
  const size_t columns = !indent.IsNone() && BeginsLine(text) ? indent.ColumnsIn(output) : 0;
  while (columns > 0 && !text.empty()) {
    if (AtLineStart()) output.append(columns, ' ');
    const size_t lineFeed = text.find('\n');
    const size_t length = lineFeed == std::string_view::npos ? text.size() : lineFeed + 1;
    output.append(text.substr(0, length));
    text.remove_prefix(length);
  }
  output.append(text);
  map.AddGenerated(source, output.size() - before);
}

NotedCall::NotedCall(ExpansionSink& sink, const char* source)
    : m_sink(sink), m_call{static_cast<int64_t>(sink.output.size()), 0, source} {
  m_sink.isInCall = true;
}

NotedCall::~NotedCall() {
  m_sink.isInCall = false;
  m_call.end = static_cast<int64_t>(m_sink.output.size());
  if (m_call.end > m_call.begin) m_sink.map.calls->push_back(m_call);
}

size_t LineIndent::ColumnsIn(std::string_view output) const {
  if (m_value >= 0) return static_cast<size_t>(m_value);
  const std::string_view before = output.substr(0, static_cast<size_t>(~m_value));
  const std::string_view line = before.substr(before.rfind('\n') + 1);
  return line.size() + (kTabWidth - 1) * static_cast<size_t>(std::count(line.begin(), line.end(), '\t'));
}

}  // namespace qrex
