// The text behind a translated .cpp file: the reflection records of what it declares, and the function that registers
// all of a project.
#pragma once

#include "text/text_writer.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

// Writes the tails of the imports that this .cpp must register and its own, and stores the lists in the registries.
void WriteReflectionTails(ScannedFile& file, TextWriter& out);
// Register_Project_P or Unregister_Project_P.
void WriteProjectRegistration(const ScannedFile& mainFile, const DeclarationRegistry& registry, TextWriter& out);

}  // namespace qrex
