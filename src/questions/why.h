// Why a build would make a file again, for `Qrex --why`.
#pragma once

#include <optional>
#include <string>

#include "workspace/workspace.h"

namespace qrex {

// Two lines: what would be made and why, and, where the cause is another file, the imports that lead there. A line for
// a file that is up to date. Nothing, with a message told, where a project lacks the configuration of the run. Raises
// what a translation raises: where other files of the project are stale, what they declare may decide.
std::optional<std::string> WhyText(ProjectFile& file);

}  // namespace qrex
