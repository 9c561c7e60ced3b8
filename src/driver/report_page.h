// The page of the key `report` and of `Qrex --report`: who makes it of what is known, and where it goes.
#pragma once

#include <string>

#include "report/build_record.h"
#include "workspace/workspace.h"

namespace qrex {

// On a build that is over. What the workspace declares is worked out here, unless it is null: none was loaded. What
// that finds to be wrong stands in the page alone.
std::string BuildPage(const ConfigSettings& settings, const BuildRecord& record, bool completed, Workspace* loaded);

// On a workspace of which nothing is built. False, with messages told: a file has an error, and the page tells what is
// known without it, or the page could not be written.
bool WriteWorkspacePage(Workspace& workspace, const std::string& path);

// Makes the folders, too. False: it could not be written, and a message has told.
bool WriteReport(ConfigSettings& settings, const std::string& path, const std::string& text);

}  // namespace qrex
