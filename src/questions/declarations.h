// The declarations of files, in the order in which they stand.
#pragma once

#include <vector>

#include "text/message.h"
#include "translator/declared/class_def.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

struct Declared {
  const NameSpaceElement* element;
  SourcePlace place;
};

// Of a translated file, without name spaces, and without types that are only announced there.
std::vector<Declared> DeclarationsOf(const ScannedFile& file);
std::vector<Declared> NestedDeclarationsOf(const ClassDef& def);  // with the mixins that it makes

}  // namespace qrex
