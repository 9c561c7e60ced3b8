// Metadata as values: what stands in the codes of types and in those of elements.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

namespace qrex {

struct MetadataValue {
  enum class Kind { Bool, Int, Float, String, Functor, List };
  Kind kind = Kind::Bool;
  int32_t number = 0;                 // of an int; of a bool 0 or 1
  double real = 0;                    // of a float
  std::string_view text;              // of a string; the name of a functor. A part of the code
  std::vector<MetadataValue> values;  // of a list; the arguments of a functor
};

// The value at the head, which is taken off the code.
MetadataValue TakeMetadataValue(std::string_view& code);
// What several lists say in turn: the code is one or more of them.
std::vector<MetadataValue> ItemsOfMetadata(std::string_view code);

}  // namespace qrex
