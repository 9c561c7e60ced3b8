// build.ninja: what a run of the tool does for a workspace, in all its configurations, as a graph that ninja follows.
// For each configuration the tool translates, once for all projects:
//
//   build qrexsource/x64/Debug/.translated: translate      its inputs the tool tells in a dependency file
//   build qrexsource/x64/Debug/.complete | FILES: complete qrexsource/x64/Debug/.translated
//
// Only the tool knows which files are stale. So the first has none of them as outputs (a failure would name them all),
// and the second, which makes what someone has deleted, says which there are; those that stay as they are count as up
// to date (restat). Compilers and linkers are told what a run tells them, by builder/source_command and target_command.
//
// ninja has `build.ninja` written anew by the tool when a file of settings or a folder of sources has changed.
#pragma once

#include <string>

#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

// A name that no ninja file can have, as of a source with a line feed in it: none may be written. Empty: there is none.
std::string NameThatNinjaLacks(const Workspace& workspace);
// Tells of sources for which there can be no rule.
void WriteNinjaFile(TextWriter& out, Workspace& workspace);

}  // namespace qrex
