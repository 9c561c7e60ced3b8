// The keeper of the tools (platform/process.h): a process that is forked from this one, shares its folder locks, and
// is the parent of all tools. When this process is gone it ends them ahead of the locks' release.
//
// Why not give the lock to the tools: what they leave running for good (the server of a compiler cache) would hold it
// for good. Such a server leaves the session of its terminal; by that the keeper knows what it must leave alone.
// The keeper is in a process group of its own, the tools in that of this process: what a terminal or a script sends
// to the group reaches the tools as ever, and not the keeper, even if it cannot be caught.
// What a tool leaves behind becomes a child of that tool, and one of the keeper when the tool has ended: so the keeper
// ends what a killed tool left, and nothing that another tool still works with.
#pragma once

#include <sys/types.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "platform/posix/descriptor.h"

namespace qrex::platform {

struct ToolRequest {
  uint32_t number = 0;             // which the reply bears
  std::string program;             // found on PATH unless it is a path
  std::vector<std::string> words;  // its name and its arguments
  int output = -1, errors = -1;    // what becomes of its streams; -1: those of the keeper
  bool errorsIntoOutput = false;
};

// How a tool ended.
struct ToolReply {
  uint32_t request = 0;
  int32_t error = 0;   // why the tool could not be started
  int32_t status = 0;  // as `waitpid` tells it
};

// The keeper as this process sees it. Each request is answered by a reply, in the order in which the tools end.
class ToolKeeper {
 public:
  static std::unique_ptr<ToolKeeper> Start();  // null: errno
  ~ToolKeeper();                               // the keeper ends the tools that run, and has released its locks
  ToolKeeper(const ToolKeeper&) = delete;
  ToolKeeper& operator=(const ToolKeeper&) = delete;

  // Behind the end of a keeper that was killed: ends what its tools had started, which would write on.
  static void EndWhatIsLeft();

  // False: the keeper is gone, and its tools with it.
  bool Ask(const ToolRequest& request);
  bool EndTools();  // each is answered as if it had ended itself
  bool Receive(ToolReply& reply);
  int Socket() const { return m_socket.Number(); }  // readable when there is a reply

 private:
  ToolKeeper(pid_t process, Descriptor socket) : m_process(process), m_socket(std::move(socket)) {}

  const pid_t m_process;
  Descriptor m_socket;
  bool m_isBroken = false;  // a request was sent in part
};

}  // namespace qrex::platform
