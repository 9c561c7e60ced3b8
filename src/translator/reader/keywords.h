// The rows of the tables of words behind `$`. The tables name handlers of all rooms: they stand in the file room, and
// the parser is given them.
#pragma once

#include <span>
#include <string_view>

namespace qrex {

class ClassDef;
class QrexParser;

struct Keyword {
  std::string_view word;
  void (*parse)(QrexParser& parser);
  bool advancesItself = false;  // leaves the first token behind its declaration as the current one
};

// The same inside a class body; a word that is none of these begins a field or a method.
struct ClassKeyword {
  std::string_view word;
  void (*parse)(QrexParser& parser, ClassDef& def);
  bool advancesItself = false;
};

struct KeywordTables {
  std::span<const Keyword> fileLevel;
  std::span<const ClassKeyword> classLevel;
};

}  // namespace qrex
