// The body of a $polymorphic function: switches over the tags of its variant arguments, with a call in each leaf.
#pragma once

#include "translator/global_defs.h"

namespace qrex {

void WriteDispatchBody(TextWriter& out, const GlobalFunctionDef& def);

}  // namespace qrex
