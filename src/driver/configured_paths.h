// The paths that a configuration names, ahead of a run.
#pragma once

#include <string>

#include "workspace/config_settings.h"

namespace qrex {

constexpr char kMarkerFile[] = ".qrwsroot";  // lies in the root of a workspace's tree

// The deepest directory of the path that holds the marker, and the path relative to it.
bool FindWorkspaceRoot(const std::string& path, std::string& root, std::string& relative);
bool CheckPathSyntax(const ConfigSettings& settings);  // false: told

}  // namespace qrex
