// What the macro layer writes: the expanded text, and a map from each output offset back to a source position.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "lex/token.h"
#include "text/message.h"

namespace qrex {

// One stretch of the output. Verbatim: a copy of the source from its begin on. Generated: all of it maps to the begin;
// null: blanks of indentation. There are several for each macro call, so a run is as small as it can be (addresses have
// 48 bits), and a longer stretch is several runs.
class SourceMapRun {
 public:
  static constexpr size_t kMostLength = (1 << 15) - 1;
  SourceMapRun() = default;
  SourceMapRun(const char* source, size_t length, bool isGenerated)
      : m_bits(reinterpret_cast<uintptr_t>(source) | static_cast<uint64_t>(length) << kAddressBits |
               static_cast<uint64_t>(isGenerated) << 63) {}
  const char* SourceBegin() const { return reinterpret_cast<const char*>(static_cast<uintptr_t>(m_bits & kAddress)); }
  size_t Length() const { return m_bits >> kAddressBits & kMostLength; }
  bool IsGenerated() const { return m_bits >> 63 != 0; }
  void Lengthen(size_t more) { m_bits += static_cast<uint64_t>(more) << kAddressBits; }

 private:
  static constexpr int kAddressBits = 48;
  static constexpr uint64_t kAddress = (uint64_t{1} << kAddressBits) - 1;
  uint64_t m_bits;
};

// The runs cover the output in order without gaps. They are never moved: a page holds twice as many as the one before.
class SourceMap {
 public:
  void AddVerbatim(const char* begin, const char* end);  // one run with the one before when their sources are adjacent
  void AddGenerated(const char* source, size_t length);
  size_t PageCount() const { return m_pages.size(); }
  size_t Bytes() const {  // of its runs
    return (PageSize(PageCount()) - PageSize(0) - static_cast<size_t>(m_pageEnd - m_next)) * sizeof(SourceMapRun);
  }
  // Of an expansion whose calls are kept: what each outermost one gave, as offsets in the output, in their order.
  struct Call {
    int64_t begin, end;
    const char* source;  // where it is called
  };
  std::unique_ptr<std::vector<Call>> calls;  // null: they are not kept
  const SourceMapRun* PageBegin(size_t page) const { return m_pages[page].get(); }
  const SourceMapRun* PageEnd(size_t page) const {
    return page + 1 == PageCount() ? m_next : PageBegin(page) + PageSize(page);
  }

 private:
  static size_t PageSize(size_t page) { return size_t{64} << page; }
  void Add(const char* source, size_t length, bool isGenerated) {
    if (m_next == m_pageEnd) AddPage();
    *m_next++ = SourceMapRun(source, length, isGenerated);
  }
  [[gnu::noinline]] void AddPage();  // apart, so that Add needs few registers
  std::vector<std::unique_ptr<SourceMapRun[]>> m_pages;
  SourceMapRun* m_next = nullptr;
  SourceMapRun* m_pageEnd = nullptr;
  const char* m_verbatimEnd = nullptr;  // of the last run; null when it is a generated one
};

const char* MapOutputOffset(const SourceMap& map,
                            int64_t offset);  // linear: for errors. Throws ExceptionBase past the end

// The same for offsets that only increase, so that a pass over the output takes linear time.
class MapCursor {
 public:
  explicit MapCursor(const SourceMap& map) : m_map(&map) {}
  const char* Map(int64_t offset);
  // Of the run that was mapped last.
  int64_t RunEnd() const { return m_runBegin + static_cast<int64_t>(m_run->Length()); }
  bool IsVerbatim() const { return !m_run->IsGenerated(); }

 private:
  const SourceMap* m_map;
  size_t m_nextPage = 0;
  const SourceMapRun* m_run = nullptr;
  const SourceMapRun* m_pageEnd = nullptr;
  int64_t m_runBegin = 0;
};

// Moves a position that lies in the output to its source position; leaves any other alone.
void MapErrorPosition(const SourceMap& map, const TextRange& output, LexScannerException& exception);

struct MpfwSourceFile;
using SourceFileList = std::vector<std::unique_ptr<MpfwSourceFile>>;
bool FindSourcePlace(const SourceFileList& files, const char* position, SourcePlace& place);
bool FindSourceLine(const SourceFileList& files, const char* position, std::string& path, int64_t& line);
// The same for a position in the expansion of one of the files.
bool FindExpandedLine(const SourceFileList& files, const char* position, std::string& path, int64_t& line);
// Whether a position in an expansion came of what the command line added to a file.
bool IsAddedText(const SourceFileList& files, const char* position);
// Its hints also tell whether the place was added to the file by the command line.
Message ParseErrorOf(const SourceFileList& files, const LexScannerException& exception);

// The column at which the lines of an expansion begin. Most expansions are within a line, so that it is kept as a
// place in the output and worked out when a line does begin.
class LineIndent {
 public:
  LineIndent(int64_t columns = 0) : m_value(columns) {}
  static LineIndent AtOffset(size_t offset) { return LineIndent(~static_cast<int64_t>(offset)); }
  bool IsNone() const { return m_value == 0; }
  size_t ColumnsIn(std::string_view output) const;  // a tab counts 4, any other byte 1

 private:
  int64_t m_value;  // columns, or the complement of an offset
};

// The sink of an expansion. Each line that begins in what is written gets the indent's blanks ahead of it.
class ExpansionSink {
 public:
  void WriteVerbatim(const TextRange& range, LineIndent indent) {
    if (indent.IsNone()) return AddVerbatim(range.begin, range.end);
    WriteIndented(range, indent);
  }
  void WriteGenerated(std::string_view text, const char* source, LineIndent indent);
  bool AtLineStart() const { return output.empty() || output.back() == '\n'; }
  // Of the text and its map: short runs take more than what they stand for.
  size_t Bytes() const { return output.size() + map.Bytes(); }
  LineIndent ColumnHere() const { return LineIndent::AtOffset(output.size()); }
  bool NotesCalls() const { return map.calls && !isInCall; }

  std::string output;
  SourceMap map;
  size_t expectedSize = 0;  // the room to make once there is something to write
  size_t bytesOutside = 0;  // of the expansions that wait for this one
  bool isInCall = false;    // that is noted

 private:
  void MakeRoom();
  bool BeginsLine(std::string_view text) const;
  void AddVerbatim(const char* begin, const char* end);
  void WriteIndented(const TextRange& range, LineIndent indent);
};

// Around a call of a macro that is noted: what it gave.
class NotedCall {
 public:
  NotedCall(ExpansionSink& sink, const char* source);
  ~NotedCall();
  NotedCall(const NotedCall&) = delete;
  NotedCall& operator=(const NotedCall&) = delete;

 private:
  ExpansionSink& m_sink;
  SourceMap::Call m_call;
};

}  // namespace qrex
