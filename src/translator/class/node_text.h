// What the nodes of fields and those of cached functions have in common.
#pragma once

#include <functional>
#include <string_view>

#include "text/text_writer.h"

namespace qrex {

struct NodeValue {
  std::string_view expression;    // where it is kept, as the node names it
  std::string_view type;          // as the node names it; empty for void
  std::string_view previousType;  // of a copy, which tells a change; empty when every recalculation counts as one
};

// The node's RecalcCache. `self` is the line that finds the object, or empty; `calculate` writes lines.
void WriteRecalcCache(TextWriter& out, const NodeValue& value, std::string_view self,
                      const std::function<void()>& calculate);

}  // namespace qrex
