#include "platform/windows/tool_output.h"

#include <array>
#include <atomic>

namespace qrex::platform {

struct PendingRead : OVERLAPPED {
  explicit PendingRead(ToolOutput& output) : OVERLAPPED{}, reader(&output) {}
  ToolOutput* reader;  // null: forgotten
  std::array<char, 65536> block;
};

ToolOutput::~ToolOutput() { Forget(); }

Handle ToolOutput::Open(HANDLE port, ULONG_PTR key) {
  static std::atomic<unsigned> count = 0;
  const std::wstring name =
      L"\\\\.\\pipe\\qrex-" + std::to_wstring(GetCurrentProcessId()) + L"-" + std::to_wstring(count++);
  constexpr DWORD kOpen = PIPE_ACCESS_INBOUND | FILE_FLAG_OVERLAPPED | FILE_FLAG_FIRST_PIPE_INSTANCE;
  constexpr DWORD kSize = 65536;
  m_pipe = Handle(
      CreateNamedPipeW(name.c_str(), kOpen, PIPE_TYPE_BYTE | PIPE_REJECT_REMOTE_CLIENTS, 1, kSize, kSize, 0, nullptr));
  if (!m_pipe || !CreateIoCompletionPort(m_pipe.Get(), port, key, 0)) return {};
  SECURITY_ATTRIBUTES inherited = {sizeof inherited, nullptr, TRUE};
  Handle other(CreateFileW(name.c_str(), GENERIC_WRITE, 0, &inherited, OPEN_EXISTING, 0, nullptr));
  if (other) Ask();
  return other;
}

void ToolOutput::Ask() {
  m_read = new PendingRead(*this);
  if (::ReadFile(m_pipe.Get(), m_read->block.data(), static_cast<DWORD>(m_read->block.size()), nullptr, m_read)) return;
  const DWORD error = GetLastError();
  if (error == ERROR_IO_PENDING) return;
  delete m_read;  // the port will tell nothing of it
  m_read = nullptr;
  if (error != ERROR_BROKEN_PIPE) m_text.Break();
  m_pipe.Close();
}

void ToolOutput::TakePart(DWORD error, DWORD size) {
  if (error == 0) return m_text.Append({m_read->block.data(), size});
  if (error != ERROR_BROKEN_PIPE) m_text.Break();
  m_pipe.Close();
}

void ToolOutput::Take(OVERLAPPED* done) {
  const std::unique_ptr<PendingRead> read(static_cast<PendingRead*>(done));
  if (!read->reader) return;
  ToolOutput& self = *read->reader;
  DWORD size = 0;
  const bool isWell = GetOverlappedResult(self.m_pipe.Get(), read.get(), &size, FALSE) != 0;
  self.TakePart(isWell ? 0 : GetLastError(), size);
  self.m_read = nullptr;
  if (self.m_pipe) self.Ask();
}

void ToolOutput::ReadRest() {
  while (m_read) {
    DWORD size = 0;
    const bool isWell = GetOverlappedResult(m_pipe.Get(), m_read, &size, FALSE) != 0;
    if (!isWell && GetLastError() == ERROR_IO_INCOMPLETE) return Forget();
    TakePart(isWell ? 0 : GetLastError(), size);
    m_read->reader = nullptr;
    m_read = nullptr;
    if (m_pipe) Ask();
  }
}

// A part may still have come while it was called off.
void ToolOutput::Forget() {
  if (!m_read) return;
  CancelIoEx(m_pipe.Get(), m_read);
  DWORD size = 0;
  if (GetOverlappedResult(m_pipe.Get(), m_read, &size, TRUE)) m_text.Append({m_read->block.data(), size});
  m_read->reader = nullptr;
  m_read = nullptr;
  m_pipe.Close();
}

}  // namespace qrex::platform
