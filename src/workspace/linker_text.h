// The raw linker switches of a configuration: as tokens, as the libraries of its target, and as properties.
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

// The properties that the switches stand for, as the project generators want them. The librarian serves static
// libraries, the linker all other targets. What cannot be read costs an "ERROR:" line.
void ParseLinkerText(const Project& project, const ProjectConfig& config, OptionMap& options);
void ParseLibrarianText(const Project& project, const ProjectConfig& config, OptionMap& options);

}  // namespace qrex
