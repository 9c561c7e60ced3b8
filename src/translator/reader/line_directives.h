// The output of a file with `#line` wherever its lines do not follow each other as those of the source do, so that
// compilers and debuggers speak of the source.
//
// The text that a declaration gives stands on the line of the declaration: its own line ends and comments are no part
// of the output. So it takes no line of what follows it, and one directive at most is needed behind it; none where a
// few empty lines do. What a macro call gives stands on the line of the call in the same way. Within parentheses, which
// may be the arguments of a macro of C++, where directives are undefined, line ends alone are put in or left out.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "lex/cpp_text_state.h"
#include "lex/scanner.h"
#include "macro/source_map.h"
#include "text/streams.h"
#include "translator/symbols/position_mark.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

struct SourceLine {
  const std::string* path = nullptr;  // null: there is none
  int64_t line = 0;
  const char* position = nullptr;
};

// Lines of positions in sources, first of all in those of one file.
class SourceLines {
 public:
  explicit SourceLines(const ScannedFile& file);
  // False: the position lies in no source of the build.
  bool Find(const char* position, SourceLine& found);
  const char* EndOfLine(const char* position) const;  // in the file's source; the position itself if it lies elsewhere

 private:
  void ReadOwnDirectives();
  const ScannedFile& m_file;
  const TextRange m_source;
  const LineStarts m_starts;
  std::set<std::string> m_paths;
  const std::string& m_path;
  std::map<int64_t, SourceLine> m_named;  // by line: what a directive of the source calls it and those behind
};

// Where an expanded text came of: what a call gave, from the place of the call. Quick where positions increase.
class ExpandedPlaces {
 public:
  ExpandedPlaces(const SourceMap& map, TextRange expanded) : m_map(map), m_expanded(expanded), m_cursor(map) {}
  struct Place {
    const char* source = nullptr;  // null: blanks
    const char* end = nullptr;     // of what it holds for, in the expanded text
    bool isVerbatim = false;       // and what follows to there follows it in the source
  };
  Place Find(const char* expanded);

 private:
  const SourceMap& m_map;
  const TextRange m_expanded;
  MapCursor m_cursor;
  size_t m_call = 0;  // the next in the map's list
  int64_t m_last = 0;
};

class LineDirectives {
 public:
  // One entry of `lineTable` is added for each line of the output, as QrexParserOutputStream has them.
  LineDirectives(IOutputStream& target, const ScannedFile& file, std::vector<const char*>& lineTable,
                 TextRange expanded);
  void WriteGenerated(std::string_view text);            // at the place copied last, or at that of a mark in it
  void WriteCopied(const char* begin, const char* end);  // of the expanded text, in its order
  void Finish();                                         // writes what is held back
  // For a mark: the source of a place in the expanded text.
  const char* SourceOf(const char* expanded) { return m_markedPlaces.Find(expanded).source; }

 private:
  void PassGenerated(char c);
  bool TakeMark(char c);
  void ReleaseMark();
  void ReleaseSlash();
  void Pass(char c, const char* at);
  const SourceLine& WantedAt(const char* at);
  const SourceLine& LineOfExpanded(const char* at);
  void MoveTo(const SourceLine& wanted, char next);
  bool JoinsLine(const SourceLine& wanted, char next, int64_t lineFeeds) const;
  bool PadsTo(const SourceLine& wanted) const;
  void WriteDirective(const SourceLine& wanted);
  void PutBlanks(std::string_view blanks);
  void Put(char c);

  IOutputStream& m_target;
  std::vector<const char*>& m_lineTable;
  const TextRange m_expanded;
  ExpandedPlaces m_places, m_markedPlaces;
  SourceLines m_lines;
  CppTextState m_state;
  SourceLine m_here;                   // of the output's line, as a compiler counts
  const char* m_lineSource = nullptr;  // what the line table gets for it
  bool m_isLineFresh = true;
  bool m_isLineEmpty = true;
  std::string m_blanks;  // held back: what follows decides on them
  // Of the last place that was asked for, and how far it holds in the expanded text.
  SourceLine m_found;
  const char* m_holdsFrom = nullptr;
  const char* m_holdsTo = nullptr;
  const char* m_copied;               // how far the expanded text has come
  SourceLine m_marked;                // of the last mark behind that
  std::optional<std::string> m_mark;  // its digits, while they come
  bool m_heldSlash = false;
  bool m_inGeneratedComment = false;
  std::string m_output;
};

}  // namespace qrex
