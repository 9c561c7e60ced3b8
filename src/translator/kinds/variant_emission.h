// The text of a variant.
#pragma once

#include "text/text_writer.h"
#include "translator/kinds/variant_def.h"

namespace qrex {

void WriteVariantBody(TextWriter& out, const VariantDef& def);  // of the class
void WriteVariantTail(TextWriter& out, const VariantDef& def);  // behind it

}  // namespace qrex
