// Where each line of a generated text came from. With the key `positionMaps` the map stays beside the text as
// FILE.qrexmap, for who asks later (`Qrex --where`); it knows the text that it is of.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "translator/symbols/scanned_file.h"

namespace qrex {

struct SourceLineView {
  std::string_view path;  // as messages name it; a part of the map
  int64_t line = 0;       // 0: it came of none, as the lines of a guard
};

class PositionMap {
 public:
  // Of the text that the last translation of the file gave.
  static PositionMap OfTranslation(const ScannedFile& file, std::string_view text);
  // Of a file that is only copied.
  static PositionMap OfCopy(const std::string& sourcePath);
  // Of another text of the same tokens: what has been kept since only blanks and comments differ. Behind the first
  // token that differs, lines follow each other as they do there.
  PositionMap RealignedTo(std::string_view other, std::string_view text, Dialect dialect) const;

  SourceLineView Find(int64_t line) const;  // from 1 on; behind the last one, what that came from

  // What was kept for this text; nothing where there is none, or for another text.
  static std::optional<PositionMap> Load(const std::string& textPath, std::string_view text);
  void Save(const std::string& textPath, std::string_view text) const;  // raises FileException
  static std::string PathFor(const std::string& textPath) { return textPath + ".qrexmap"; }

 private:
  // From this line on to the next run: each is of one line further than the one ahead of it, or all are of the same.
  struct Run {
    int64_t begin = 1;
    uint32_t path = 0;
    int64_t line = 1;
    bool advances = true;
  };
  void Add(int64_t line, std::string_view path, int64_t sourceLine);

  std::vector<std::string> m_paths;
  std::vector<Run> m_runs;  // by increasing begin, the first one from 1 on
};

// Line ends of `text` count as one whether CR LF or LF.
int64_t CountLines(std::string_view text);

}  // namespace qrex
