// What classes and variants have in common: their fields, and the words of their << >> lists.
#pragma once

#include <cstdint>
#include <string>

#include "translator/types/type_code.h"

namespace qrex {

enum class TriState : uint8_t { Unset, Off, On };  // `-word` is off, `word` is on
inline bool OnOr(TriState state, bool otherwise) {
  return state == TriState::Unset ? otherwise : state == TriState::On;
}

enum class FieldKind { Plain, Indep, Dep };

struct ClassField {
  std::string name;
  TypeCode type;
  FieldKind kind = FieldKind::Plain;
  bool reflected = false;
};

// The words of a class's << >> list that are kept as they are said.
struct ClassQualifiers {
  TriState abstract{}, dc{}, copy{}, compare{}, print{}, ser{}, os{}, ar{}, extern_{}, passbyvalue{}, returnbyvalue{},
      multiline{}, traits{}, genop{}, rod{};
};

}  // namespace qrex
