#include "platform/process.h"

#include <algorithm>
#include <atomic>
#include <csignal>
#include <cstdio>

#include "platform/console.h"
#include "platform/windows/child.h"
#include "platform/windows/tool_output.h"

namespace qrex::platform {

namespace {

using Cause = ProcessEnd::Cause;

constexpr int kUnknownCommand = 9009;            // as the interpreter has it
constexpr DWORD kEndedByInterrupt = 0xC000013A;  // the status of one that Ctrl-C has ended
constexpr DWORD kFirstException = 0xC0000000;    // that nobody handled

ProcessEnd Interrupted() { return {Cause::EndedBySignal, SIGINT, {}}; }

ProcessEnd NotStarted(DWORD error, bool isInterpreter) {
  using Failure = ProcessEnd::StartFailure;
  ProcessEnd end{Cause::NotStarted, 0, Failure::Other};
  switch (error) {
    case ERROR_FILE_NOT_FOUND:
    case ERROR_PATH_NOT_FOUND:
      end.failure = Failure::NotFound;
      if (!isInterpreter) end.cause = Cause::NotFound;
      break;
    case ERROR_ACCESS_DENIED:
      if (!isInterpreter) end.cause = Cause::NotExecutable;
      break;
    case ERROR_BAD_EXE_FORMAT:
      end.failure = Failure::BadFormat;
      if (!isInterpreter) end.cause = Cause::NotExecutable;
      break;
    case ERROR_FILENAME_EXCED_RANGE:
      end.failure = Failure::TooLong;
      break;
    case ERROR_NOT_ENOUGH_MEMORY:
    case ERROR_OUTOFMEMORY:
      end.failure = Failure::NoMemory;
      break;
    default:
      break;
  }
  return end;
}

ProcessEnd EndOf(DWORD status) {
  if (status == kEndedByInterrupt) return Interrupted();
  return {status >= kFirstException ? Cause::EndedBySignal : Cause::Exited, static_cast<int>(status), {}};
}

}  // namespace

// --- How a program ended

bool ProcessEnd::IsInterrupt() const { return cause == Cause::EndedBySignal && code == SIGINT; }

int ProcessEnd::InterpreterCode() const {
  if (cause == Cause::NotStarted) return -1;
  if (IsInterrupt()) return static_cast<int>(kEndedByInterrupt);
  const bool isMissing = cause == Cause::NotFound || cause == Cause::NotExecutable;
  return isMissing && code == 0 ? kUnknownCommand : code;
}

std::string ProcessEnd::EndedBy() const {
  if (IsInterrupt()) return "an interrupt";
  if (static_cast<DWORD>(code) == kEndedByUs) return "this program";
  char text[32];
  std::snprintf(text, sizeof text, "exception 0x%08X", static_cast<unsigned>(code));
  return text;
}

bool FitsCommandLine(const std::vector<std::string>& words) {
  constexpr size_t kRoom = 1024;
  return Wide(AsOneLine(words)).size() + kRoom <= kLongestCall;
}

// --- What a tool prints is UTF-8, or else in the code page of the console, line by line.

std::string TextOfTool(std::string text) {
  if (IsValidUtf8(text)) return text;
  const UINT codePage = GetConsoleOutputCP() != 0 ? GetConsoleOutputCP() : GetACP();
  std::string utf8;
  for (std::string_view rest = text; !rest.empty();) {
    const std::string_view line = rest.substr(0, std::min(rest.find('\n'), rest.size() - 1) + 1);
    rest.remove_prefix(line.size());
    if (IsValidUtf8(line)) {
      utf8 += line;
      continue;
    }
    const int size = static_cast<int>(line.size());
    std::wstring wide(line.size(), L'\0');
    wide.resize(static_cast<size_t>(MultiByteToWideChar(codePage, 0, line.data(), size, wide.data(), size)));
    utf8 += Narrow(wide);
  }
  return utf8;
}

// --- Interrupts

namespace {

std::atomic<bool> isInterrupted = false;

BOOL WINAPI NoteInterrupt(DWORD event) {
  if (event != CTRL_C_EVENT && event != CTRL_BREAK_EVENT) return FALSE;
  isInterrupted = true;
  return TRUE;
}

// An interrupt is noted while a tool runs: the tool got it as well, and what it leaves has to be cleared away.
class InterruptWatch {
 public:
  InterruptWatch() {
    isInterrupted = false;
    SetConsoleCtrlHandler(NoteInterrupt, TRUE);
  }
  ~InterruptWatch() { SetConsoleCtrlHandler(NoteInterrupt, FALSE); }
  InterruptWatch(const InterruptWatch&) = delete;
  InterruptWatch& operator=(const InterruptWatch&) = delete;
};

// --- What runs

enum EventKey : ULONG_PTR { kOutputKey, kEndKey };

class Running {
 public:
  explicit Running(Processes::Id id) : output(ended.output), errors(ended.errors) { ended.id = id; }
  ~Running() {
    if (m_wait) UnregisterWaitEx(m_wait, INVALID_HANDLE_VALUE);
  }
  Running(const Running&) = delete;
  Running& operator=(const Running&) = delete;

  // The port is told when the process has ended.
  void Watch(Handle started, HANDLE toTell) {
    process = std::move(started);
    port = toTell;
    const auto tell = [](void* self, BOOLEAN) {
      const Running& running = *static_cast<Running*>(self);
      PostQueuedCompletionStatus(running.port, running.ended.id, kEndKey, nullptr);
    };
    RegisterWaitForSingleObject(&m_wait, process.Get(), tell, this, INFINITE,
                                WT_EXECUTEONLYONCE | WT_EXECUTEINWAITTHREAD);
  }

  Processes::Ended ended;
  ToolOutput output, errors;
  ToolJob job;
  Handle process;
  HANDLE port = nullptr;
  bool isUnknown = false;  // to all but perhaps the interpreter

 private:
  HANDLE m_wait = nullptr;
};

Handle Inheritable(DWORD standardHandle) {
  HANDLE copy = nullptr;
  const HANDLE own = GetStdHandle(standardHandle), process = GetCurrentProcess();
  if (!own || !DuplicateHandle(process, own, process, &copy, 0, TRUE, DUPLICATE_SAME_ACCESS))
    return OpenNul(GENERIC_WRITE);
  return Handle(copy);
}

}  // namespace

class Processes::Host {
 public:
  explicit Host(std::deque<Ended>& ended)
      : m_ended(ended), m_port(CreateIoCompletionPort(INVALID_HANDLE_VALUE, nullptr, 0, 1)) {}
  ~Host() { Stop(); }
  Host(const Host&) = delete;
  Host& operator=(const Host&) = delete;

  void Start(const Program& program, Id id);
  size_t RunningCount() const { return m_running.size(); }
  void ReadAndReap(int milliseconds);
  void EndAll();
  void Stop();

 private:
  DWORD Create(const Program& program, const Call& call, Running& running);
  void End(Running& running, ProcessEnd end);
  void Reap(Id id);

  std::deque<Ended>& m_ended;
  Handle m_port;
  std::vector<std::unique_ptr<Running>> m_running;
  std::unique_ptr<InterruptWatch> m_interrupts;  // while a tool runs
};

// Well: 0.
DWORD Processes::Host::Create(const Program& program, const Call& call, Running& running) {
  const bool takesOutput = program.output == Program::Stream::Captured;
  const bool takesErrors = program.errors == Program::Stream::Captured;
  const Handle input = OpenNul(GENERIC_READ);
  const Handle output = takesOutput ? running.output.Open(m_port.Get(), kOutputKey) : Inheritable(STD_OUTPUT_HANDLE);
  const Handle errors = takesErrors ? running.errors.Open(m_port.Get(), kOutputKey) : Inheritable(STD_ERROR_HANDLE);
  if (!input || !output || !errors) return GetLastError();
  Handle process;
  const HANDLE streams[] = {input.Get(), output.Get(), program.errorsIntoOutput ? output.Get() : errors.Get()};
  if (const DWORD error = StartChild(call, streams, running.job, process); error != 0) return error;
  running.Watch(std::move(process), m_port.Get());
  return 0;
}

void Processes::Host::Start(const Program& program, Id id) {
  m_running.push_back(std::make_unique<Running>(id));
  Running& running = *m_running.back();
  const Call call = program.words.empty() ? CallOfLine(program.line) : CallOfWords(program.words);
  running.isUnknown = call.isUnknown;
  if (!m_interrupts) m_interrupts = std::make_unique<InterruptWatch>();
  FlushStdout();
  if (const DWORD error = Create(program, call, running); error != 0)
    End(running, NotStarted(error, call.isInterpreted));
}

void Processes::Host::ReadAndReap(int milliseconds) {
  DWORD number = 0;
  ULONG_PTR key = 0;
  OVERLAPPED* read = nullptr;
  const DWORD most = milliseconds < 0 ? INFINITE : static_cast<DWORD>(milliseconds);
  const bool isWell = GetQueuedCompletionStatus(m_port.Get(), &number, &key, &read, most) != 0;
  if (read) {
    ToolOutput::Take(read);
  } else if (isWell && key == kEndKey) {
    Reap(number);
  }
}

void Processes::Host::Reap(Id id) {
  for (const auto& running : m_running) {
    if (running->ended.id != id) continue;
    DWORD status = 0;
    GetExitCodeProcess(running->process.Get(), &status);
    ProcessEnd end = EndOf(status);
    if (end.cause == Cause::Exited && running->isUnknown && end.code != 0) end.cause = Cause::NotFound;
    return End(*running, end);
  }
}

// A tool that was killed leaves nothing that goes on; what another one left (the server of a compiler cache) may.
void Processes::Host::End(Running& running, ProcessEnd end) {
  if (end.cause == Cause::Exited) {
    running.job.LeaveTheRest();
  } else {
    running.job.End();
  }
  running.output.ReadRest();
  running.errors.ReadRest();
  running.ended.end = isInterrupted ? Interrupted() : end;
  m_ended.push_back(std::move(running.ended));
  std::erase_if(m_running, [&](const auto& each) { return each.get() == &running; });
  if (m_running.empty()) m_interrupts.reset();
}

void Processes::Host::EndAll() {
  for (const auto& running : m_running) running->job.End();
  while (!m_running.empty()) ReadAndReap(kForever);
}

void Processes::Host::Stop() {
  for (const auto& running : m_running) {
    running->job.End();
    WaitForSingleObject(running->process.Get(), INFINITE);
  }
  m_running.clear();
  m_interrupts.reset();
  while (m_port) {  // what was still to be told
    DWORD number = 0;
    ULONG_PTR key = 0;
    OVERLAPPED* read = nullptr;
    const bool isWell = GetQueuedCompletionStatus(m_port.Get(), &number, &key, &read, 0) != 0;
    if (read) ToolOutput::Take(read);
    if (!isWell && !read) break;
  }
}

Processes::Processes() : m_host(std::make_unique<Host>(m_ended)) {}
Processes::~Processes() = default;

Processes::Id Processes::Start(const Program& program) {
  m_host->Start(program, m_nextId);
  return m_nextId++;
}

size_t Processes::RunningCount() const { return m_host->RunningCount(); }
void Processes::ReadAndReap(int milliseconds) { m_host->ReadAndReap(milliseconds); }
void Processes::EndAll() { m_host->EndAll(); }
void Processes::Stop() { m_host->Stop(); }

}  // namespace qrex::platform
