#include "platform/peer_process.h"

#include "platform/windows/child.h"

namespace qrex::platform {

namespace {

constexpr DWORD kBuffer = 1 << 16;

struct Pipe {
  Handle reads, writes;
};

// The end that is not ours is inherited by the program, and by no other that is started meanwhile.
Pipe MakePipe(Handle Pipe::*theirs) {
  Pipe pipe;
  HANDLE reads = nullptr, writes = nullptr;
  if (!CreatePipe(&reads, &writes, nullptr, kBuffer)) return pipe;
  pipe.reads = Handle(reads);
  pipe.writes = Handle(writes);
  SetHandleInformation((pipe.*theirs).Get(), HANDLE_FLAG_INHERIT, HANDLE_FLAG_INHERIT);
  return pipe;
}

}  // namespace

PeerProcess::PeerProcess(const std::vector<std::string>& words) {
  if (words.empty()) return;
  Pipe input = MakePipe(&Pipe::reads), output = MakePipe(&Pipe::writes);
  const Handle errors = OpenNul(GENERIC_WRITE);
  const HANDLE streams[] = {input.reads.Get(), output.writes.Get(), errors.Get()};
  ToolJob job;
  Handle process;
  if (!input.reads || !output.reads || StartChild(CallOfWords(words), streams, job, process) != 0) return;
  m_process = AsNumber(job.Release());
  m_writes = AsNumber(input.writes.Release());
  m_reads = AsNumber(output.reads.Release());
}

PeerProcess::~PeerProcess() {
  if (!IsStarted()) return;
  for (const intptr_t each : {m_writes, m_reads, m_process})
    CloseHandle(AsHandle(each));  // with the job the program ends
}

// A read ends with the program: it alone holds the other end.
void PeerProcess::CloseStreams() {
  if (IsStarted()) TerminateJobObject(AsHandle(m_process), 1);
}

bool PeerProcess::Write(std::string_view bytes) {
  while (!bytes.empty()) {
    DWORD count = 0;
    if (!::WriteFile(AsHandle(m_writes), bytes.data(), static_cast<DWORD>(bytes.size()), &count, nullptr)) return false;
    bytes.remove_prefix(count);
  }
  return true;
}

bool PeerProcess::Read(std::string& bytes) {
  const size_t size = bytes.size();
  bytes.resize(size + kBuffer);
  DWORD count = 0;
  if (!::ReadFile(AsHandle(m_reads), bytes.data() + size, kBuffer, &count, nullptr)) count = 0;
  bytes.resize(size + count);
  return count > 0;
}

}  // namespace qrex::platform
