// What the class of a variant does by its tag: copying, destroying, comparing, printing, visiting and archiving.
#pragma once

#include <string>

#include "text/text_writer.h"
#include "translator/kinds/variant_def.h"

namespace qrex {

// The definitions of the members that switch on the tag, in the class or behind it.
void WriteVariantMembers(TextWriter& out, const VariantDef& def);
// Whether a new value is made ahead of destroying the old one, which the plain text does not: what throws in between
// leaves a value that is destroyed twice there, and a part of the old value is gone when it is copied.
bool MakesValueFirst(const VariantDef& def);
// Of the move constructor: unless the value of an item may throw.
std::string NoexceptText(const VariantDef& def);
// Makes the item's value, of this type, in the memory of the variant; without its arguments.
std::string ConstructionText(const VariantItem& item, const std::string& type);

}  // namespace qrex
