// The words of << >> lists that are kept as they are said, of classes and variants.
#pragma once

#include <span>
#include <string_view>

#include "translator/declared/qualifiers.h"

namespace qrex {

class ClassDef;
class QrexParser;

struct QualifierWord {
  std::string_view word;
  TriState ClassQualifiers::*state;
  bool needsReflection;  // has an effect only on reflected ones
  bool onVariant;
};
std::span<const QualifierWord> QualifierWords();
const QualifierWord* FindQualifierWord(std::string_view word);  // null: there is none

bool ParseQualifierList(QrexParser& parser, ClassDef& def);  // behind `<<`; true when some entry needs reflection

}  // namespace qrex
