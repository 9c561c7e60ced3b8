// Starts tools through a process of its own, the keeper, which is forked from this one and shares its folder locks.
// While a tool runs the lock is held, whoever else dies; and when this process is gone, however it ended, the keeper
// ends the tools ahead of the lock's release. So no compiler that outlived its run writes over what a later run made.
//
// Why not give the lock to the tools: what they leave running for good (the server of a compiler cache) would hold it
// for good. Such a server leaves the session of its terminal; by that the keeper knows what it must leave alone.
// The keeper is in a process group of its own, the tools in that of this process: what a terminal or a script sends
// to the group reaches the tools as ever, and not the keeper, even if it cannot be caught.
#pragma once

#include <sys/types.h>

#include <string>

namespace qrex::platform {

class ToolKeeper {
 public:
  ToolKeeper() = default;
  ~ToolKeeper() { Stop(); }
  ToolKeeper(const ToolKeeper&) = delete;
  ToolKeeper& operator=(const ToolKeeper&) = delete;

  // Runs a line of the shell in the folder in which the keeper was started and waits for its end: the exit code, or
  // 128 and the signal that ended it. An interrupt of this process during the run counts as one that ended the tool.
  // -1 when it could not be run: errno.
  int Run(const std::string& shellLine);
  void Stop();  // waits until it has released its locks

 private:
  // By the first tool: the fork costs as much as a small run that calls none. False: errno.
  bool Start();
  int Ask(const std::string& shellLine);
  void WaitForEnd();

  pid_t m_process = -1;
  int m_socket = -1;
};

}  // namespace qrex::platform
