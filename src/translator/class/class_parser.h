// Reading $struct, $class, $adt, $mixin and $model statements. A class body is plain C++ that is copied through, with
// `$` items taken out and replaced.
#pragma once

#include <string>
#include <vector>

#include "translator/declared/class_def.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

// The keyword is the current token; leaves it on the closing `;`.
void ParseClass(QrexParser& parser, ClassKind kind, ClassDef* enclosing);  // `enclosing`: null at file level

// --- Shared with the other kinds that live in classes
void ParseClassBody(QrexParser& parser, ClassDef& def);  // on `{`; leaves it on the matching `}`
void ParseFieldOrMethod(QrexParser& parser, ClassDef& def);
void ParseThis(QrexParser& parser, ClassDef& def);           // stands behind the word afterwards
bool ParseQualifierList(QrexParser& parser, ClassDef& def);  // behind `<<`; true when some entry needs reflection

// The words of << >> lists that are kept as they are said, of classes and variants.
struct QualifierWord {
  std::string_view word;
  TriState ClassQualifiers::*state;
  bool needsReflection;  // has an effect only on reflected ones
  bool onVariant;
};
const QualifierWord* FindQualifierWord(std::string_view word);  // null: there is none

void WriteForwardDeclaration(TextWriter& out, const ClassDef& def);
void WriteReflectionDeclarations(TextWriter& out, const ClassDef& def);

}  // namespace qrex
