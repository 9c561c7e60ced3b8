// The `@` variables that every translated file starts with: what it is, where it lies, and what it is translated for.
#pragma once

namespace qrex {

class ScannedFile;
void DefinePredefinedVariables(ScannedFile& file);

}  // namespace qrex
