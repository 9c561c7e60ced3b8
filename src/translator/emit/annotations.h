// Metadata as annotations of C++26 (P3394), for compilers that reflect. `$float64 x : [ unit("m") ];` becomes
//
//   #ifdef __cpp_impl_reflection
//   [[=unit("m")]]
//   #endif
//   float64 x;
#pragma once

#include "translator/symbols/name_space.h"
#include "translator/types/type_view.h"

namespace qrex {

// The lines ahead of the declaration of a member of this type. Nothing without the key `annotations`, nor for a type
// that has no metadata of its own. What stands on the line already is ended.
enum class OutputLine { Begins, HasText };
void WriteAnnotations(TextWriter& out, const NameSpaceElement& owner, TypeView type, OutputLine line);

}  // namespace qrex
