// Where the build of a project in one configuration has its files. Generated projects name the same ones.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "workspace/workspace.h"

namespace qrex {

// qrexsource/PLATFORM/CONFIG, and the dependency file of a project there.
std::string TranslationDirectory(const ProjectConfig& config);
std::string DependencyFilePath(const Project& project, const ProjectConfig& config);
// Of the sources, as the compiler sees them.
std::string CompiledDirectory(const Project& project, const ProjectConfig& config);
// What the compiler searches: the project's own directories, below the translation directory if `translated`, else
// below its root; then every root of the tree.
std::vector<std::string> IncludePaths(const Project& project, const ProjectConfig& config, bool translated);

// The name with "lib" ahead and its extension behind as the gcc family has them; the path is below
// exportLib/PLATFORM/CONFIG/.
std::string GccTargetName(const Project& project);
std::string GccTargetPath(const Project& project, const ProjectConfig& config);
std::string_view GccTargetExtension(TargetType type);  // "a", "so", "???" of a utility project; empty for programs

// Whether a build translates files of the project, and this one of such a project: of one that comes built the headers.
bool IsTranslated(const Project& project);
bool IsTranslated(const ProjectFile& file);
bool HasObject(const ProjectFile& file);  // C, C++ and assembler sources

class BuildPaths {
 public:
  BuildPaths(const Project& project, const ProjectConfig& config);

  const std::string& Intermediate() const { return m_intermediate; }  // PLATFORM/CONFIG/PROJECT: objects
  std::string Library() const;                                        // exportLib/PLATFORM/CONFIG: targets
  std::string Translated(const ProjectFile& file) const;
  std::string Compiled(const ProjectFile& file) const;  // what the compiler is given: a translation or a source
  std::string Object(const ProjectFile& file) const;
  std::string ResourceObject(const ProjectFile& file) const;
  std::string Target() const;

 private:
  bool IsGcc() const { return IsGccFamily(m_project.settings->compiler); }

  const Project& m_project;
  const ProjectConfig& m_config;
  const std::string m_translation, m_intermediate;
};

}  // namespace qrex
