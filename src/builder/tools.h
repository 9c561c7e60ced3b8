// The tools that a build runs, and the steps in which it runs them.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "builder/project_builder.h"

namespace qrex {

std::unique_ptr<BuildStep> ObjectStep(ProjectBuilder& builder, const ScannedFile& file);  // compiled or assembled
std::unique_ptr<BuildStep> ResourceStep(ProjectBuilder& builder, const ScannedFile& file);
// Links, and embeds the manifest: a target without it must not pass for a good one.
std::unique_ptr<BuildStep> TargetStep(ProjectBuilder& builder, std::string target, std::vector<std::string> inputs);

}  // namespace qrex
