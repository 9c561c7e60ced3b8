// A text by the lines and columns of the protocol. Lines count from 0 and end in CR LF, CR or LF, of which the text
// keeps LF alone, so that columns stay as they are; columns count UTF-16 units or bytes, as was agreed.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "server/json_rpc.h"

namespace qrex::server {

enum class Columns { Utf8, Utf16 };

struct Position {
  int64_t line = 0, column = 0;
  auto operator<=>(const Position&) const = default;
};

class TextIndex {
 public:
  TextIndex() : TextIndex(std::string()) {}
  explicit TextIndex(std::string text);
  const std::string& Text() const { return m_text; }
  // What lies behind the end of a line, or of the text, is taken for that end.
  size_t OffsetOf(Position position, Columns columns) const;
  Position PositionOf(size_t offset, Columns columns) const;
  size_t LineCount() const { return m_starts.size(); }
  std::string_view Line(size_t line) const;  // without its end

 private:
  std::string m_text;
  std::vector<size_t> m_starts;
};

Position PositionFrom(const Json& json);
Json ToJson(Position position);
// The range of two offsets.
Json RangeJson(const TextIndex& text, size_t begin, size_t end, Columns columns);

bool IsWordByte(char c);
// Of the word that an offset stands in or at the end of; empty where there is none.
struct WordPlace {
  size_t begin = 0, end = 0;
};
WordPlace WordAt(std::string_view text, size_t offset);

// file:// addresses and paths; empty for an address of another kind.
std::string PathOfUri(std::string_view uri);
std::string UriOfPath(std::string_view path);

}  // namespace qrex::server
