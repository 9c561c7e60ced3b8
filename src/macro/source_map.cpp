#include "macro/source_map.h"

#include <algorithm>
#include <cstring>

#include "lex/scanner.h"
#include "lex/sections.h"
#include "macro/mpfw_parser.h"

namespace qrex {

namespace {

const char* MapInRun(const SourceMapRun& run, int64_t offsetInRun) {
  return run.generatedLength ? run.sourceBegin : run.sourceBegin + offsetInRun;
}

[[noreturn]] void FailBeyondEnd() { throw ExceptionBase("INTERNAL ERROR: offset lies beyond the source map"); }

}  // namespace

const char* MapOutputOffset(const SourceMap& map, int64_t offset) {
  MapCursor cursor(map);
  return cursor.Map(offset);
}

const char* MapCursor::Map(int64_t offset) {
  for (; m_run < m_map->size(); ++m_run) {
    const SourceMapRun& run = (*m_map)[m_run];
    const int64_t length = run.OutputLength();
    if (offset < m_runBegin + length) return MapInRun(run, offset - m_runBegin);
    m_runBegin += length;
  }
  FailBeyondEnd();
}

void MapErrorPosition(const SourceMap& map, const TextRange& output, LexScannerException& exception) {
  if (!exception.position || output.Empty() || !output.Contains(exception.position)) return;
  const int64_t last = output.end - output.begin - 1;
  exception.position = MapOutputOffset(map, std::min<int64_t>(exception.position - output.begin, last));
}

bool FindSourceLine(const SourceFileList& files, const char* position, std::string& path, int64_t& line) {
  if (!position) return false;
  for (const auto& file : files) {
    const TextRange text{std::string_view(file->text)};
    if (!text.Contains(position)) continue;
    path = file->path;
    line = LineOfPosition(text, position);
    return true;
  }
  return false;
}

void ReportParseError(const SourceFileList& files, TextWriter& writer, const LexScannerException& exception) {
  std::string path;
  int64_t line;
  writer << "\n";
  if (FindSourceLine(files, exception.position, path, line)) writer << path << "(" << line << ") : ";
  writer << exception.message << "\n";
}

// Text goes out line by line: only a line's begin may need blanks ahead of it.
void ExpansionSink::WriteVerbatim(const TextRange& range, int64_t indent) {
  const char* runBegin = range.begin;
  auto closeRun = [&](const char* end) {
    if (runBegin == end) return;
    output.append(runBegin, end);
    if (!map.empty() && map.back().generatedLength == 0 && map.back().sourceEnd == runBegin) {
      map.back().sourceEnd = end;
    } else {
      map.push_back({runBegin, end, 0});
    }
    runBegin = end;
  };
  for (const char* at = range.begin; at < range.end;) {
    if (column < 0) {
      if (indent > 0) {
        closeRun(at);
        output.append(static_cast<size_t>(indent), ' ');
        map.push_back({nullptr, nullptr, indent});
      }
      column = std::max<int64_t>(indent, 0);
    }
    const void* lineFeed = std::memchr(at, '\n', static_cast<size_t>(range.end - at));
    const char* const end = lineFeed ? static_cast<const char*>(lineFeed) : range.end;
    column += (end - at) + (kTabWidth - 1) * std::count(at, end, '\t');
    at = end;
    if (lineFeed) {
      column = -1;
      ++at;
    }
  }
  closeRun(range.end);
}

void ExpansionSink::WriteGenerated(std::string_view text, const TextRange& source, int64_t indent) {
  if (text.empty()) return;
  const size_t before = output.size();
  for (char c : text) {
    if (column < 0) {
      if (indent > 0) output.append(static_cast<size_t>(indent), ' ');
      column = std::max<int64_t>(indent, 0);
    }
    output += c;
    column = c == '\n' ? -1 : column + (c == '\t' ? kTabWidth : 1);
  }
  map.push_back({source.begin, source.end, static_cast<int64_t>(output.size() - before)});
}

}  // namespace qrex
