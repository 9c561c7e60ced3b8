// The dependency file of a project: what each file imports and when it was translated, and who registers what.
//
// A checked file (text/files.h) with the magic 0x2AEF78F1. Payload; strings are a compact length and their bytes:
//   per file, in byte order of the paths: path, translation time (8 bytes), number of imports (4), path of each import,
//     1 byte: it declares something that needs registration;
//   an empty string;
//   twice (register, unregister): number of .cpp files as a compact length; per file path, number of names, each name.
// All numbers are little-endian. Equal results give equal bytes but for the times.
#pragma once

#include <string>

#include "builder/build_files.h"

namespace qrex {

// False, with the builder as it was, when there is no such file or it does not fit: then every file is translated.
bool LoadDependencyFile(BuildFiles& builder, const std::string& path);
void SaveDependencyFile(BuildFiles& builder, const std::string& path);  // clears the registries' dirty flags

std::string DependencyPayload(const BuildFiles& builder);
bool ParseDependencyPayload(BuildFiles& builder, std::string_view payload);  // throws DeserialisationException

}  // namespace qrex
