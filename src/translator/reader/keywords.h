// The row types of the keyword tables. The tables refer to handlers of all rooms, so they are defined in the file room
// and passed to the parser.
#pragma once

#include <span>
#include <string_view>

namespace qrex {

class ClassDef;
class QrexParser;

// Which token a handler leaves as the current one: the last of its declaration, or the first behind it.
enum class EndsOn { LastToken, NextToken };

struct Keyword {
  std::string_view word;
  void (*parse)(QrexParser& parser);
  EndsOn endsOn = EndsOn::LastToken;
};

enum class Scope { Body, BodyAndCode };  // in class bodies; in blocks of code within them, too

// The same inside a class body; a word that is none of these begins a field or a method.
struct ClassKeyword {
  std::string_view word;
  void (*parse)(QrexParser& parser, ClassDef& def);
  Scope scope = Scope::Body;
  EndsOn endsOn = EndsOn::LastToken;
};

struct KeywordTables {
  std::span<const Keyword> fileLevel;
  std::span<const ClassKeyword> classLevel;
};

}  // namespace qrex
