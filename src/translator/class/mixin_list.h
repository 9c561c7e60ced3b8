// Mixin lists, the bodies of abstract data types, and `implementing`.
#pragma once

#include <string>

#include "translator/declared/class_def.h"

namespace qrex {

class QrexParser;

void ParseMixinList(QrexParser& parser, ClassDef& def, std::string& baseText);  // on `[`; stands behind `]` afterwards
void ParseAdtBody(QrexParser& parser, ClassDef& adt);                           // on `{`; leaves it on the matching `}`
void ParseImplementing(QrexParser& parser, ClassDef& def);                      // on the word; leaves it on `;`

}  // namespace qrex
