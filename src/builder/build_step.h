// A step of a build: what tools, one behind the other, make of files. It is prepared, its command runs, and it is
// finished; a scheduler does so (builder/scheduler.h), and has other steps begin and end meanwhile. So a step keeps
// what it has in hand to itself, and counts what it finds.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "builder/build_observer.h"
#include "builder/run_command.h"

namespace qrex {

class BuildStep {
 public:
  virtual ~BuildStep() = default;

  // Tells of the next command and leaves ready what it needs. None: the step is over.
  virtual std::optional<Command> Prepare() = 0;
  virtual void Finish(const CommandResult& result) = 0;  // of that command
  virtual ToolTask Task() const { return {}; }           // of that command
  // Once it is over. A step that failed has said why and counted an error, and nothing half made is left of it.
  bool HasSucceeded() const { return m_hasSucceeded; }

 protected:
  bool m_hasSucceeded = false;
};

}  // namespace qrex
