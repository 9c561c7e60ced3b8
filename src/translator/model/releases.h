// The history of a model, release by release.
#pragma once

#include <vector>

#include "translator/declared/class_def.h"

namespace qrex {

struct ModelRelease {
  int64_t number;
  std::vector<const ModelField*> drops, adds;  // in the order of all fields
};

// In the order of their numbers. A model without $schema has one, of number 0.
std::vector<ModelRelease> ReleasesOf(const ClassDef& def);

}  // namespace qrex
