// Mixin lists, the bodies of abstract data types, and `implementing`.
#pragma once

#include <string>

#include "translator/declared/class_def.h"

namespace qrex {

class QrexParser;

void ParseMixinList(QrexParser& parser, ClassDef& def, std::string& baseText);  // on `[`; afterwards behind `]`
void ParseAdtBody(QrexParser& parser, ClassDef& adt);       // on `{`; afterwards on the matching `}`
void ParseImplementing(QrexParser& parser, ClassDef& def);  // on the word; afterwards on `;`

}  // namespace qrex
