// The text of an enumeration.
#pragma once

#include "text/text_writer.h"
#include "translator/kinds/enum_def.h"

namespace qrex {

void WriteEnumText(TextWriter& out, const EnumDef& def);       // in place, with the declarations of its reflection
void WriteEnumSerialise(TextWriter& out, const EnumDef& def);  // of a plain enumeration

}  // namespace qrex
