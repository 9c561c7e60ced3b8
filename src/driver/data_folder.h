// Where that is which comes with the program: the templates of `--init`, the runtime library as sources and, where an
// installation has it, built.
#pragma once

#include <optional>
#include <span>
#include <string>

#include "workspace/config_settings.h"

namespace qrex {

inline constexpr char kRuntimePart[] = "runtime";

// The folder that holds all of the parts: the one that QREX_DATA_FOLDER names in the environment, or else that of the
// program, which may not be told by the system: then it is found by the first word of the command line. `tried` is for
// a message when there is none: each on a line of its own.
std::optional<std::string> FindDataFolder(const std::string& calledAs, std::span<const char* const> parts,
                                          std::string& tried);

// Sees to `runtime`: its root comes behind those of the workspace. The problem, in the form of ValidateSettings.
std::string AddRuntimeRoot(ConfigSettings& settings, const std::string& calledAs);

}  // namespace qrex
