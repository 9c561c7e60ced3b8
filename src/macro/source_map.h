// What the macro layer writes: the expanded text, and a map from each output offset back to a source position.
#pragma once

#include <cstdint>
#include <list>
#include <memory>
#include <string>
#include <vector>

#include "lex/token.h"

namespace qrex {

// One stretch of the output. generatedLength 0: a verbatim copy of the source range. Above 0 with positions: all of it
// maps to sourceBegin. Above 0 with null positions: blanks of indentation. Runs cover the output in order without gaps;
// adjacent verbatim runs of adjacent source are one run.
struct SourceMapRun {
  const char* sourceBegin = nullptr;
  const char* sourceEnd = nullptr;
  int64_t generatedLength = 0;
  int64_t OutputLength() const { return generatedLength ? generatedLength : sourceEnd - sourceBegin; }
};
using SourceMap = std::vector<SourceMapRun>;

const char* MapOutputOffset(const SourceMap& map,
                            int64_t offset);  // linear: for errors. Throws ExceptionBase past the end

// The same for offsets that only increase, so that a pass over the output takes linear time.
class MapCursor {
 public:
  explicit MapCursor(const SourceMap& map) : m_map(&map) {}
  const char* Map(int64_t offset);

 private:
  const SourceMap* m_map;
  size_t m_run = 0;
  int64_t m_runBegin = 0;
};

// Moves a position that lies in the output to its source position; leaves any other alone.
void MapErrorPosition(const SourceMap& map, const TextRange& output, LexScannerException& exception);

struct MpfwSourceFile;
using SourceFileList = std::vector<std::unique_ptr<MpfwSourceFile>>;
bool FindSourceLine(const SourceFileList& files, const char* position, std::string& path, int64_t& line);
void ReportParseError(const SourceFileList& files, TextWriter& writer, const LexScannerException& exception);

// The sink of an expansion. `column` is -1 at the beginning of a line; a tab counts 4.
class ExpansionSink {
 public:
  void WriteVerbatim(const TextRange& range, int64_t indent);
  void WriteGenerated(std::string_view text, const TextRange& source, int64_t indent);

  std::string output;
  int64_t column = -1;
  SourceMap map;
};

}  // namespace qrex
