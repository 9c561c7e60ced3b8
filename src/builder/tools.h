// The tools that a build runs, and the steps in which it runs them.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "builder/project_builder.h"

namespace qrex {

// --- Paths that the build and the generated projects share
// What the compiler searches: the project's own directories, below the translation directory if `translated`, else
// below its root; then every root of the tree.
std::vector<std::string> IncludePaths(const Project& project, const ProjectConfig& config, bool translated);
// Of the sources, as the compiler sees them.
std::string CompiledDirectory(const Project& project, const ProjectConfig& config);
// The name with "lib" ahead and its extension behind as the gcc family has them; the path is below
// exportLib/PLATFORM/CONFIG/.
std::string GccTargetName(const Project& project);
std::string GccTargetPath(const Project& project, const ProjectConfig& config);
std::string_view GccTargetExtension(TargetType type);  // "a", "so", "???" of a utility project; empty for programs

// --- Of one build
bool HasObject(const ProjectFile& file);  // C, C++ and assembler sources
std::string ObjectPath(const ProjectBuilder& builder, const ProjectFile& file);
std::string ResourceObjectPath(const ProjectBuilder& builder, const ProjectFile& file);
std::string TargetPath(const ProjectBuilder& builder);

std::unique_ptr<BuildStep> CompileStep(ProjectBuilder& builder, const ScannedFile& file);
std::unique_ptr<BuildStep> AssembleStep(ProjectBuilder& builder, const ScannedFile& file);
std::unique_ptr<BuildStep> ResourceStep(ProjectBuilder& builder, const ScannedFile& file);
std::vector<std::string> CollectLinkInputs(ProjectBuilder& builder);
// What the linker switches name as libraries, in the gcc family: the target is stale when one of them is newer, as with
// an input.
std::vector<std::string> LibrariesOfSwitches(const ProjectBuilder& builder);
// Links, and embeds the manifest: a target without it must not pass for a good one.
std::unique_ptr<BuildStep> TargetStep(ProjectBuilder& builder, std::string target, std::vector<std::string> inputs);

}  // namespace qrex
