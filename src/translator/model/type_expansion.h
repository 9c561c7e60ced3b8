// How far generated text follows a type: into the fields of models, and on into the elements of containers. The text
// is finite only if no model is reached again from within itself.
#pragma once

#include <string>
#include <string_view>

#include "translator/declared/class_def.h"

namespace qrex {

// What is generated. A field that is decorated as assignable is got and set whole and ends each way.
enum class Expansion {
  Accessors,         // of a model's fields: through arrays and maps, into classes of kind model
  AttributeStructs,  // as Accessors; below an array or map its forwarders go into the model of any class
  Methods            // of an interface's attributes: through vectors, into the model of any class
};

// Why a type can't be expanded ("$model Node contains itself"); empty when it can. `self`: the class whose model is
// just being read or expanded, or null. `reached`: how many fields and elements the text has for `self` so far.
std::string ExpansionFault(TypeView type, NameSpace& root, Expansion expansion, const ClassDef* self,
                           size_t* reached = nullptr);

}  // namespace qrex
