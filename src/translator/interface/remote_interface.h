// The text of an `ipc` or `rmi` interface beyond its record: client and server sides, and their factories.
#pragma once

#include "translator/interface/interface_def.h"

namespace qrex {

// Enters the factories among the names that the interface's file registers.
void WriteRemoteInterface(TextWriter& out, const InterfaceDef& interface);

}  // namespace qrex
