// Types, metadata and signatures as JSON; docs/reflect.md has the form.
#pragma once

#include <string_view>

#include "report/json_writer.h"
#include "translator/types/type_view.h"

namespace qrex {

void WriteTypeMembers(JsonWriter& json, TypeView type);           // "type", "shape", and "metadata" where it has any
void WriteMetadata(JsonWriter& json, std::string_view metadata);  // the member; nothing for an empty one
void WriteSignature(JsonWriter& json, const FunctionSignature& signature);  // the members behind the name

}  // namespace qrex
