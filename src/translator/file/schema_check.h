// Whether the models of a file keep to the releases that are recorded, with the key schemaLock.
#pragma once

#include "translator/symbols/scanned_file.h"

namespace qrex {

// Of a file that was translated, ahead of writing it: asks its host for each model. Raises a LexScannerException at the
// first `$schema` that does not.
void CheckSchemas(const ScannedFile& file);

}  // namespace qrex
