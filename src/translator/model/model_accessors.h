// The accessors, paths and barriers of model fields.
#pragma once

#include "translator/declared/class_def.h"
#include "translator/model/attribute_struct.h"

namespace qrex {

// The object that a model mixin is a part of.
inline constexpr std::string_view kConstFinal = "static_cast<const typename BC::FinalClass*>(this)";
inline constexpr std::string_view kFinal = "static_cast<typename BC::FinalClass*>(this)";

void WriteModelStructAccessors(TextWriter& out, const ClassDef& def);  // in the struct that holds the fields
// In the mixin of `def`, over the fields of `model` (the referenced model or `def`), with "_model_." ahead of each.
void WriteModelMixinAccessors(TextWriter& out, const ClassDef& def, const ClassDef& model, Access access);
// The attribute structs in the mixin's union.
void WriteModelMixinAttributeStructs(TextWriter& out, const ClassDef& def, const ClassDef& model, Access access);

}  // namespace qrex
