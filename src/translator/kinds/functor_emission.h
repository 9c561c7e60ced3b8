// The text of a functor.
#pragma once

#include <string_view>

#include "text/text_writer.h"
#include "translator/kinds/functor_def.h"

namespace qrex {

void WriteFunctorClass(TextWriter& out, const FunctorDef& def);
// "R name(void* _self,T a)": a stub function, by which a functor calls.
void WriteSelfSignature(TextWriter& out, const FunctionSignature& signature, std::string_view name);

}  // namespace qrex
