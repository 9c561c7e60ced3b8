// Reading $struct, $class, $adt, $mixin and $model statements.
#pragma once

#include "translator/declared/class_def.h"

namespace qrex {

class QrexParser;

// The current token is the keyword, afterwards the closing `;`.
void ParseClass(QrexParser& parser, ClassKind kind, ClassDef* enclosing);  // `enclosing`: null at file level

}  // namespace qrex
