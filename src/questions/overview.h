// What a workspace declares and imports, for the page: as much of it as can be had where files have errors.
//
//   {"faults": [{"text", "place"?, "line"?}], "faultyFiles": [path], "reflection": as docs/reflect.md has it,
//    "imports": {"projects": [name], "files": [[path, project, is faulty, [file]]]}}
//
// Projects and files are referred to by their index.
#pragma once

#include <string>

#include "text/message.h"
#include "workspace/workspace.h"

namespace qrex {

struct Overview {
  std::string json;
  bool isWhole = false;  // no file has an error
};

// Of a workspace that is loaded. Translates in memory, goes on behind each error, and leaves the settings as they were.
// `alsoTold`, unless null, gets all messages; else they are dropped.
Overview OverviewOf(Workspace& workspace, MessageConsumer* alsoTold);

}  // namespace qrex
