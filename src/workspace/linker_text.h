// The raw linker switches of a configuration: as tokens, and as the libraries of its target.
#pragma once

#include <set>
#include <string>
#include <vector>

#include "workspace/project_model.h"

namespace qrex {

// Split at white space; a double-quoted stretch in a token stays whole. Throws LexScannerException for an open quote.
std::vector<std::string> LinkerTokens(const std::string& text);
bool IsQuoted(const std::string& token);
std::string Unquoted(const std::string& token);

struct LibraryChoice {
  bool skipDefaultLibraries = false;
  bool forBuild = true;
};
// Sorted, each once. Static subprojects bring their own libraries along.
void GatherLibraries(const Project& project, const ProjectConfig& config, LibraryChoice choice,
                     std::set<std::string>& libraries);

}  // namespace qrex
