// What archives hold of a model, as text that can be kept and compared: a line for each release of its `$schema`, and
// one for each enumeration, variant and model without `$schema` that is stored with it. No word of a line has a blank.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <tuple>
#include <vector>

#include "translator/declared/class_def.h"

namespace qrex {

enum class SchemaKind { Release, Enum, Variant, Model };

struct SchemaKey {
  std::string project;  // the folder below the root
  std::string name;     // qualified
  SchemaKind kind = SchemaKind::Release;
  int64_t release = 0;

  auto operator<=>(const SchemaKey&) const = default;
};

struct SchemaLine {
  SchemaKey key;
  // Of a release "-dropped +added:TYPE", of an enumeration "label:number", of the others "name:TYPE", in their order.
  std::vector<std::string> words;
};

std::vector<SchemaLine> SchemaLinesOf(const ClassDef& def);  // its releases come first
std::string SchemaProject(std::string_view folder);          // as lines have it

}  // namespace qrex
