// How far generated accessors follow a type: into the fields of models, and on into the elements of containers. The
// text that comes of it is finite only where the way never leads back to a model that it passed.
#pragma once

#include <string>
#include <string_view>

#include "translator/class_def.h"

namespace qrex {

enum class Follow {
  Elements,  // of arrays and maps: accessors, attribute structs and their forwarders
  Vectors    // the methods of an interface's attributes
};

// Why a type can't be expanded ("$model Node contains itself"); empty when it can. `self`: the class whose model is
// just being read, or null.
std::string ExpansionFault(std::string_view type, NameSpace& root, Follow follow, const ClassDef* self);

}  // namespace qrex
