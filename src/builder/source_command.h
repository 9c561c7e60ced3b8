// What compiles a source, and what it is told: the one place that says it, for the build and for generated files that
// have others compile.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "builder/build_paths.h"

namespace qrex {

// What the compiler is told of each source of a project in a configuration.
struct CommonSwitches {
  std::string raw;  // as the project has them; empty where they are read into options, which differ from file to file
  std::vector<std::string> includePaths;
};
CommonSwitches CommonSwitchesOf(const Project& project, const ProjectConfig& config);

struct SourceCommand {
  std::vector<std::string> launcher;  // ahead of the tool
  std::string tool;                   // with what each of its calls is told
  std::string_view name;              // of the tool, for its response file
  std::string text;                   // what stands behind it, on its line or in that file
  std::string input, object;
  bool hasFile = true;  // the text stands in the file

  // As it is told, and its words as they are run. An empty path: the text stands on the line.
  std::string Line(const std::string& responseFile) const;
  std::vector<std::string> Words(CompilerKind compiler, const std::string& responseFile) const;
  std::string Program() const;  // the first word of the tool
};
std::string AssemblerOf(const ProjectConfig& config);
// Of a source that has an object.
SourceCommand SourceCommandOf(const Project& project, const ProjectConfig& config, const ProjectFile& file);

}  // namespace qrex
