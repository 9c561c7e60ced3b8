#include "platform/windows/child.h"

#include <algorithm>
#include <array>
#include <vector>

namespace qrex::platform {

namespace {

constexpr int kMoreTries = 5;
constexpr DWORD kPause = 50;  // milliseconds

// What keeps a process from being made may be over in a moment: a scanner reads the program, or the system is short.
bool MayPass(DWORD error) {
  return error == ERROR_SHARING_VIOLATION || error == ERROR_NO_SYSTEM_RESOURCES || error == ERROR_INTERNAL_ERROR;
}

// What a new process is given: of the handles of this one its three streams alone, and the job that it belongs to from
// its very begin, where the system can do that (Windows 10).
class Inheritance {
 public:
  Inheritance(const HANDLE (&streams)[3], HANDLE job) : m_streams(std::to_array(streams)), m_job(job) {
    constexpr DWORD_PTR kJobList = 0x2000D;  // PROC_THREAD_ATTRIBUTE_JOB_LIST
    SIZE_T size = 0;
    InitializeProcThreadAttributeList(nullptr, 2, 0, &size);
    m_space.resize(size);
    InitializeProcThreadAttributeList(List(), 2, 0, &size);
    UpdateProcThreadAttribute(List(), 0, kJobList, &m_job, sizeof m_job, nullptr, nullptr);
    std::sort(m_streams.begin(), m_streams.end());
    const auto end = std::unique(m_streams.begin(), m_streams.end());
    UpdateProcThreadAttribute(List(), 0, PROC_THREAD_ATTRIBUTE_HANDLE_LIST, m_streams.data(),
                              static_cast<size_t>(end - m_streams.begin()) * sizeof(HANDLE), nullptr, nullptr);
  }
  ~Inheritance() { DeleteProcThreadAttributeList(List()); }
  Inheritance(const Inheritance&) = delete;
  Inheritance& operator=(const Inheritance&) = delete;
  LPPROC_THREAD_ATTRIBUTE_LIST List() { return reinterpret_cast<LPPROC_THREAD_ATTRIBUTE_LIST>(m_space.data()); }

 private:
  std::array<HANDLE, 3> m_streams;
  HANDLE m_job;
  std::vector<char> m_space;
};

}  // namespace

Handle OpenNul(DWORD access) {
  SECURITY_ATTRIBUTES inherited = {sizeof inherited, nullptr, TRUE};
  return Handle(CreateFileW(L"NUL", access, kShareAll, &inherited, OPEN_EXISTING, 0, nullptr));
}

DWORD StartChild(const Call& call, const HANDLE (&streams)[3], ToolJob& job, Handle& process) {
  std::wstring text = Wide(call.text);
  if (call.program.empty()) return ERROR_FILE_NOT_FOUND;
  if (text.size() > (call.isInterpreted ? kLongestInterpreted : kLongestCall)) return ERROR_FILENAME_EXCED_RANGE;
  Inheritance inheritance(streams, job.Get());
  STARTUPINFOEXW start = {};
  start.StartupInfo.cb = sizeof start;
  start.StartupInfo.dwFlags = STARTF_USESTDHANDLES;
  start.StartupInfo.hStdInput = streams[0];
  start.StartupInfo.hStdOutput = streams[1];
  start.StartupInfo.hStdError = streams[2];
  start.lpAttributeList = inheritance.List();
  constexpr DWORD kFlags = EXTENDED_STARTUPINFO_PRESENT | CREATE_UNICODE_ENVIRONMENT | CREATE_SUSPENDED;
  PROCESS_INFORMATION made;
  const std::wstring file = Wide(call.program);
  const auto create = [&] {
    return CreateProcessW(file.c_str(), text.data(), nullptr, nullptr, TRUE, kFlags, nullptr, nullptr,
                          &start.StartupInfo, &made) != 0;
  };
  bool isMade = create();
  for (int i = 0; i < kMoreTries && !isMade && MayPass(GetLastError()); ++i) {
    Sleep(kPause);
    isMade = create();
  }
  if (!isMade) return GetLastError();
  if (!made.hProcess) return ERROR_BAD_EXE_FORMAT;  // something was started that is none of this system's processes
  const Handle thread(made.hThread);
  job.Add(made.hProcess);  // at the latest, ahead of its first step: all that it starts belongs there
  process = Handle(made.hProcess);
  ResumeThread(made.hThread);
  return 0;
}

}  // namespace qrex::platform
