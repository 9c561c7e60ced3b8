// What makes a target, and of what: the one place that says it, for the build and for generated files that have others
// link.
#pragma once

#include <string>
#include <vector>

#include "workspace/project_model.h"

namespace qrex {

// Objects, then libraries of the workspace in the order in which a linker wants them.
std::vector<std::string> CollectLinkInputs(Project& project, const ProjectConfig& config);
// What the linker switches name as libraries, in the gcc family: the target is stale when one of them is newer, as with
// an input.
std::vector<std::string> LibrariesOfSwitches(const Project& project, const ProjectConfig& config);

struct TargetCommand {
  std::string tool;  // linker or librarian, and what must stand on its line
  std::string text;  // of its response file
};
TargetCommand TargetCommandOf(const Project& project, const ProjectConfig& config, const std::string& target,
                              const std::vector<std::string>& inputs);

}  // namespace qrex
