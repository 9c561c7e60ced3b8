// What a tool prints on one stream, read through a pipe without waiting: the system tells at a port when a part is
// there.
#pragma once

#include <memory>
#include <vector>

#include "platform/process.h"
#include "platform/windows/api.h"

namespace qrex::platform {

// One read that was asked for. The port tells of it once, also where nobody wants it any more: until then it lives.
struct PendingRead;

class ToolOutput {
 public:
  explicit ToolOutput(CapturedText& text) : m_text(text) {}
  ~ToolOutput();
  ToolOutput(const ToolOutput&) = delete;
  ToolOutput& operator=(const ToolOutput&) = delete;

  // The other end of the pipe, for the tool to inherit; none: LastError.
  Handle Open(HANDLE port, ULONG_PTR key);
  static void Take(OVERLAPPED* read);  // the port told of it
  void ReadRest();                     // what was printed so far: who the tool left behind may hold the pipe open

 private:
  friend struct PendingRead;
  void Ask();
  void TakePart(DWORD error, DWORD size);
  void Forget();

  CapturedText& m_text;
  Handle m_pipe;
  PendingRead* m_read = nullptr;  // owned, until it is forgotten
};

}  // namespace qrex::platform
