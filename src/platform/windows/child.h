// Programs that this one starts.
#pragma once

#include "platform/windows/api.h"
#include "platform/windows/interpreter.h"

namespace qrex::platform {

constexpr DWORD kEndedByUs = 0xC000010A;  // "the process is ending"

// A tool, with all that it starts, as one thing: it ends with this process, however that ends, unless it ended before.
// Servers that are to stay leave it when they are started, if they ask for that as they should.
class ToolJob {
 public:
  ToolJob() : m_job(CreateJobObjectW(nullptr, nullptr)) { Limit(JOB_OBJECT_LIMIT_KILL_ON_JOB_CLOSE); }
  HANDLE Get() const { return m_job.Get(); }
  void Add(HANDLE process) { AssignProcessToJobObject(m_job.Get(), process); }
  void End() { TerminateJobObject(m_job.Get(), kEndedByUs); }
  void LeaveTheRest() { Limit(0); }
  HANDLE Release() { return m_job.Release(); }  // it ends with this handle

 private:
  void Limit(DWORD flags) {
    JOBOBJECT_EXTENDED_LIMIT_INFORMATION limits = {};
    limits.BasicLimitInformation.LimitFlags = flags | JOB_OBJECT_LIMIT_BREAKAWAY_OK;
    SetInformationJobObject(m_job.Get(), JobObjectExtendedLimitInformation, &limits, sizeof limits);
  }
  Handle m_job;
};

// Its standard input, output and errors have to be inheritable. Well: 0, or else LastError.
DWORD StartChild(const Call& call, const HANDLE (&streams)[3], ToolJob& job, Handle& process);

Handle OpenNul(DWORD access);  // inheritable

}  // namespace qrex::platform
