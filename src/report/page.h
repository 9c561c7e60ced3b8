// The page on a build and a workspace: one file of HTML with its style, its script and its data, which asks nothing of
// anybody. The data is a JSON text in an element of its own; the script makes tables and drawings of it, so that names
// are text, whatever they hold. What follows from the record alone is worked out here, what depends on what is looked
// at there.
//
//   {"title", "subtitle", "began": ms since 1970, "total", "slots": with the translation's, "completed", "errors",
//    "warnings", "spans": [{"kind", "file"?, "output", "project", "begin", "time", "slot"?, "depth"?, "inner"?, "why"?,
//    "failed"?, "cut"?}], "critical": [span], "files": [[path, project, [import]]],
//    "reasons": [{"text", "path"?, "time"?: ms since 1970}], "projects": [name],
//    "messages": [{"severity", "text", "place"?, "line"?, "generated"?, "path"?, "lines"?: [[number, text]]}],
//    "built", "workspace"?: what questions/overview.h tells}
//
// Times are microseconds, from the begin of the run. Files, projects, spans and reasons are referred to by their index;
// what is 0, false or unknown is left out where a ? stands.
#pragma once

#include <string>
#include <string_view>

#include "report/build_record.h"

namespace qrex {

struct PageHeading {
  std::string title, subtitle;
  bool completed = true;  // the run was not ended early, by an error or the user
  bool built = true;      // else nothing was asked for but the workspace
};

// `workspace`: JSON; empty: nothing is known of it.
std::string PageText(const BuildRecord& record, const PageHeading& heading, std::string_view workspace = {});

// The longest chain of steps of which each needs what the one ahead of it makes: a translation, its compiler, links. No
// number of jobs makes the build shorter. Indices of spans.
std::vector<size_t> CriticalPath(const BuildRecord& record);

}  // namespace qrex
