// The text of an interface in place: the handle struct with its function table, the delegator mixin, declarations.
#pragma once

#include "translator/interface/interface_def.h"

namespace qrex {

void WriteInterfaceHandle(TextWriter& out, const InterfaceDef& interface);
void WriteInterfaceDeclarations(TextWriter& out, const InterfaceDef& interface);

}  // namespace qrex
