// Shared libraries that are loaded while the tool runs.
#pragma once

#include <string>

namespace qrex::platform {

// Loads a library for the rest of the process, its symbols visible to libraries that load later. A name without a slash
// is looked for where the system keeps libraries. Null on failure, with the system's reason.
void* LoadDynamicLibrary(const std::string& nameOrPath, std::string& error);
void* FindSymbol(void* library, const char* name);  // null: the library has no such symbol
std::string LibraryPathOf(const void* symbol);      // the file that a symbol was loaded from; empty if unknown

}  // namespace qrex::platform
