#include "translator/reader/qualifiers.h"

#include <algorithm>

#include "translator/declared/class_def.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

std::span<const QualifierWord> QualifierWords() {
  using Q = ClassQualifiers;
  static constexpr QualifierWord kWords[] = {
      {"dc", &Q::dc, true, false},
      {"abstract", &Q::abstract, false, false},
      {"copy", &Q::copy, true, true},
      {"compare", &Q::compare, true, true},
      {"print", &Q::print, true, true},
      {"ser", &Q::ser, true, true},
      {"os", &Q::os, false, true},
      {"ar", &Q::ar, false, true},
      {"extern", &Q::extern_, false, true},
      {"passbyvalue", &Q::passbyvalue, true, true},
      {"returnbyvalue", &Q::returnbyvalue, true, true},
      {"multiline", &Q::multiline, false, true},
      {"traits", &Q::traits, false, false},
      {"genop", &Q::genop, false, false},
      {"rod", &Q::rod, false, false},
  };
  return kWords;
}

const QualifierWord* FindQualifierWord(std::string_view word) {
  const std::span<const QualifierWord> words = QualifierWords();
  const auto found =
      std::find_if(words.begin(), words.end(), [&](const QualifierWord& candidate) { return candidate.word == word; });
  return found == words.end() ? nullptr : &*found;
}

bool ParseQualifierList(QrexParser& parser, ClassDef& def) {
  bool redundant = false;
  for (; !parser.Accept(kShiftRight); parser.Advance()) {
    const bool on = !parser.Accept(kMinus);
    if (const QualifierWord* word = FindQualifierWord(parser.current.text.View())) {
      if (!on && word->word == "dc" && def.IsPureModel()) parser.Fail("Qualifier <<-dc>> invalid for a $model");
      def.m_qualifiers.*word->state = on ? TriState::On : TriState::Off;
      redundant = redundant || word->needsReflection;
    } else if (parser.Is("nested")) {
      def.m_nested = true;
    } else if (parser.Is("reflect")) {
      if (on && def.m_nested) parser.Fail("Qualifier <<reflect>> invalid for a nested type");
      def.m_reflected = on;
      if (on) {
        def.m_strict = true;
      } else {
        def.m_registered = false;
      }
    } else if (parser.Is("register")) {
      if (on && def.m_nested) parser.Fail("Qualifier <<register>> invalid for a nested type");
      def.m_registered = on;
      if (on) def.m_reflected = def.m_strict = true;
    } else {
      parser.Fail("Unrecognised qualifier << " + Printed(parser.current) + " >> on " + PrintedElement(def));
    }
  }
  return redundant;
}

}  // namespace qrex
