// The words behind `$` at file level, and their handlers. A new kind adds its handler here.
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

std::span<const Keyword> FileLevelKeywords();

// The same inside a class body; a word that is none of these begins a field or a method.
struct ClassKeyword {
  std::string_view word;
  void (*parse)(QrexParser& parser, ClassDef& def);
  bool advancesItself = false;
};

std::span<const ClassKeyword> ClassLevelKeywords();

}  // namespace qrex
