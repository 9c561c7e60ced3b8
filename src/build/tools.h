// The tools that a build runs. Each call echoes its command, counts errors and warnings in the builder, and answers
// false on failure.
#pragma once

#include <string>
#include <vector>

#include "build/project_builder.h"

namespace qrex {

std::string ObjectPath(const ProjectBuilder& builder, const ProjectFile& file);
std::string ResourceObjectPath(const ProjectBuilder& builder, const ProjectFile& file);
std::string TargetPath(const ProjectBuilder& builder);

bool CompileFile(ProjectBuilder& builder, ScannedFile& file);
bool AssembleFile(ProjectBuilder& builder, ScannedFile& file);
bool CompileResource(ProjectBuilder& builder, ScannedFile& file);
std::vector<std::string> CollectLinkInputs(ProjectBuilder& builder);
bool LinkTarget(ProjectBuilder& builder, const std::string& target, const std::vector<std::string>& inputs);
bool EmbedManifest(ProjectBuilder& builder, const std::string& target);

}  // namespace qrex
