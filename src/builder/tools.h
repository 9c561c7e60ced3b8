// The tools that a build runs, and the steps in which it runs them.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "builder/project_builder.h"

namespace qrex {

std::unique_ptr<BuildStep> ObjectStep(ProjectBuilder& builder, const ScannedFile& file);  // compiled or assembled
std::unique_ptr<BuildStep> ResourceStep(ProjectBuilder& builder, const ScannedFile& file);
std::vector<std::string> CollectLinkInputs(ProjectBuilder& builder);
// What the linker switches name as libraries, in the gcc family: the target is stale when one of them is newer, as with
// an input.
std::vector<std::string> LibrariesOfSwitches(const ProjectBuilder& builder);
// What the linker or librarian is told, its response file included.
std::string LinkText(const ProjectBuilder& builder, const std::string& target, const std::vector<std::string>& inputs);
// Links, and embeds the manifest: a target without it must not pass for a good one.
std::unique_ptr<BuildStep> TargetStep(ProjectBuilder& builder, std::string target, std::vector<std::string> inputs);

}  // namespace qrex
