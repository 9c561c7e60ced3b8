#include "platform/process.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/wait.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstring>

#include "platform/console.h"
#include "platform/interpreter.h"
#include "platform/posix/interpreter.h"
#include "platform/posix/tool_keeper.h"

namespace qrex::platform {

namespace {

// What the interpreter answers when no program did.
constexpr int kNotExecutable = 126;
constexpr int kNotFound = 127;
constexpr int kEndedBySignal = 128;  // plus the signal
constexpr int kLastSignal = 64;

struct Pipe {
  Descriptor read, write;
};

bool MakePipe(Pipe& made) {
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) return false;
  made.read = Descriptor(ends[0]);
  made.write = Descriptor(ends[1]);
  fcntl(ends[0], F_SETFL, O_NONBLOCK);
  return true;
}

ProcessEnd BySignal(int number) { return {ProcessEnd::Cause::EndedBySignal, number, {}}; }

ProcessEnd NotStarted(int error, bool isLine) {
  using Failure = ProcessEnd::StartFailure;
  if (!isLine && (error == ENOENT || error == ENOTDIR)) return {ProcessEnd::Cause::NotFound, 0, Failure::NotFound};
  if (!isLine && error == EACCES) return {ProcessEnd::Cause::NotExecutable, 0, Failure::Other};
  ProcessEnd end{ProcessEnd::Cause::NotStarted, 0, Failure::Other};
  if (error == ENOENT || error == ENOTDIR) end.failure = Failure::NotFound;
  if (error == E2BIG) end.failure = Failure::TooLong;
  if (error == ENOEXEC) end.failure = Failure::BadFormat;
  if (error == ENOMEM) end.failure = Failure::NoMemory;
  return end;
}

ProcessEnd EndOf(int status, bool isLine) {
  using Cause = ProcessEnd::Cause;
  if (WIFSIGNALED(status)) return BySignal(WTERMSIG(status));
  const int code = WEXITSTATUS(status);
  if (!isLine) return {Cause::Exited, code, {}};
  if (code == kNotFound) return {Cause::NotFound, code, {}};
  if (code == kNotExecutable) return {Cause::NotExecutable, code, {}};
  if (code > kEndedBySignal && code <= kEndedBySignal + kLastSignal) return BySignal(code - kEndedBySignal);
  return {Cause::Exited, code, {}};
}

}  // namespace

// --- How a program ended

bool ProcessEnd::IsInterrupt() const { return cause == Cause::EndedBySignal && (code == SIGINT || code == SIGQUIT); }

int ProcessEnd::InterpreterCode() const {
  switch (cause) {
    case Cause::Exited:
      return code;
    case Cause::EndedBySignal:
      return kEndedBySignal + code;
    case Cause::NotFound:
      return kNotFound;
    case Cause::NotExecutable:
      return kNotExecutable;
    case Cause::NotStarted:
      break;
  }
  return -1;
}

std::string ProcessEnd::EndedBy() const { return "signal " + std::to_string(code); }

std::string TextOfTool(std::string text) { return text; }

// --- Interrupts

namespace {

volatile std::sig_atomic_t interruptedBy = 0;

// An interrupt is noted while a tool runs: the tool got it as well, and what it leaves has to be cleared away.
class InterruptWatch {
 public:
  InterruptWatch() {
    interruptedBy = 0;
    for (size_t i = 0; i < 2; ++i) {
      struct sigaction noted = {};
      noted.sa_handler = [](int signal) { interruptedBy = signal; };
      noted.sa_flags = SA_RESTART;
      sigaction(kSignals[i], nullptr, &m_before[i]);
      if (m_before[i].sa_handler != SIG_IGN) sigaction(kSignals[i], &noted, nullptr);
    }
  }
  ~InterruptWatch() {
    for (size_t i = 0; i < 2; ++i) sigaction(kSignals[i], &m_before[i], nullptr);
  }
  InterruptWatch(const InterruptWatch&) = delete;
  InterruptWatch& operator=(const InterruptWatch&) = delete;
  static int Signal() { return interruptedBy; }

 private:
  static constexpr int kSignals[] = {SIGINT, SIGQUIT};
  struct sigaction m_before[2];
};

// --- What runs

class Running {
 public:
  Processes::Ended ended;
  bool isLine = false;
  Descriptor output, errors;

  void ReadOutput() { Read(output, ended.output); }
  void ReadErrors() { Read(errors, ended.errors); }
  // What it printed last. The streams may stay open: what it left behind holds them.
  void ReadRest() {
    while (Read(output, ended.output) || Read(errors, ended.errors)) {
    }
  }

 private:
  // What can be had at once; false: nothing. The end of the stream closes it.
  static bool Read(Descriptor& stream, CapturedText& text) {
    if (!stream.IsOpen()) return false;
    std::array<char, 65536> block;
    const ssize_t size = read(stream.Number(), block.data(), block.size());
    if (size > 0) text.Append(std::string_view(block.data(), static_cast<size_t>(size)));
    if (size > 0 || (size < 0 && errno == EINTR)) return true;
    if (size < 0 && errno == EAGAIN) return false;
    if (size < 0) text.Break();
    stream.Close();
    return false;
  }
};

}  // namespace

bool FitsCommandLine(const std::vector<std::string>& words) {
  constexpr size_t kLongestWord = size_t{32} * 4096 - 1;  // of Linux: MAX_ARG_STRLEN
  constexpr size_t kRoom = size_t{64} * 1024;
  const long limit = sysconf(_SC_ARG_MAX);
  size_t size = kRoom;
  const auto add = [&](size_t length) { size += length + 1 + sizeof(char*); };
  for (const std::string& word : words) {
    if (word.size() > kLongestWord) return false;
    add(word.size());
  }
  for (char** variable = environ; *variable; ++variable) add(std::strlen(*variable));
  return limit < 0 || size <= static_cast<size_t>(limit);
}

class Processes::Host {
 public:
  explicit Host(std::deque<Ended>& ended) : m_ended(ended) {}

  void Start(const Program& program, Id id);
  size_t RunningCount() const { return m_running.size(); }
  void ReadAndReap(int milliseconds);
  void EndAll();
  void Stop();

 private:
  bool Ask(const Program& program, Running& started, int& error);
  void ReapOne();
  void LoseKeeper();
  void End(Running& running, ProcessEnd end);

  std::deque<Ended>& m_ended;
  std::vector<std::unique_ptr<Running>> m_running;
  std::unique_ptr<InterruptWatch> m_interrupts;  // while a tool runs
  std::unique_ptr<ToolKeeper> m_keeper;  // from the first tool on: it costs as much as a small run without tools
};

bool Processes::Host::Ask(const Program& program, Running& started, int& error) {
  Pipe output, errors;
  if (!m_keeper) m_keeper = ToolKeeper::Start();
  if (!m_keeper || (program.output == Program::Stream::Captured && !MakePipe(output)) ||
      (program.errors == Program::Stream::Captured && !MakePipe(errors))) {
    error = errno;
    return false;
  }
  ToolRequest request;
  request.number = started.ended.id;
  request.words = started.isLine ? WordsWithoutInterpreter(program.line) : program.words;
  if (request.words.empty() || (started.isLine && !FitsCommandLine(request.words))) {
    request.program = kInterpreterPath;
    request.words = {"sh", "-c", ForInterpreter(program.line)};
  } else {
    request.program = request.words.front();
  }
  request.output = output.write.Number();
  request.errors = errors.write.Number();
  request.errorsIntoOutput = program.errorsIntoOutput;
  FlushStdout();
  started.output = std::move(output.read);
  started.errors = std::move(errors.read);
  if (!m_keeper->Ask(request)) LoseKeeper();
  return true;
}

void Processes::Host::Start(const Program& program, Id id) {
  m_running.push_back(std::make_unique<Running>());
  Running& started = *m_running.back();
  started.ended.id = id;
  started.isLine = program.words.empty();
  if (started.isLine && IsBatchFile(program.line)) {
    return End(started, {ProcessEnd::Cause::Exited, RunBatchFile(program.line), {}});
  }
  if (!m_interrupts) m_interrupts = std::make_unique<InterruptWatch>();
  int error = 0;
  if (!Ask(program, started, error)) End(started, NotStarted(error, started.isLine));
}

void Processes::Host::EndAll() {
  if (m_running.empty()) return;
  if (!m_keeper->EndTools()) LoseKeeper();
  while (!m_running.empty()) ReadAndReap(kForever);
}

void Processes::Host::Stop() {
  m_keeper.reset();
  m_running.clear();
  m_interrupts.reset();
}

// A signal ends the waiting, too.
void Processes::Host::ReadAndReap(int milliseconds) {
  std::vector<pollfd> awaited = {{m_keeper->Socket(), POLLIN, 0}};
  for (const auto& running : m_running) {
    awaited.push_back({running->output.Number(), POLLIN, 0});  // one that is closed is passed over
    awaited.push_back({running->errors.Number(), POLLIN, 0});
  }
  if (poll(awaited.data(), awaited.size(), milliseconds) <= 0) return;
  for (size_t i = 0; i < m_running.size(); ++i) {
    if (awaited[2 * i + 1].revents != 0) m_running[i]->ReadOutput();
    if (awaited[2 * i + 2].revents != 0) m_running[i]->ReadErrors();
  }
  if (awaited[0].revents != 0) ReapOne();
}

void Processes::Host::ReapOne() {
  ToolReply reply;
  if (!m_keeper->Receive(reply)) return LoseKeeper();
  for (const auto& running : m_running) {
    if (running->ended.id != reply.request) continue;
    return End(*running,
               reply.error != 0 ? NotStarted(reply.error, running->isLine) : EndOf(reply.status, running->isLine));
  }
}

// Its tools do not outlive it.
void Processes::Host::LoseKeeper() {
  m_keeper.reset();
  ToolKeeper::EndWhatIsLeft();
  while (!m_running.empty()) End(*m_running.front(), BySignal(SIGKILL));
}

void Processes::Host::End(Running& running, ProcessEnd end) {
  const int interrupt = m_interrupts ? InterruptWatch::Signal() : 0;
  running.ReadRest();
  running.ended.end = interrupt != 0 ? BySignal(interrupt) : end;
  m_ended.push_back(std::move(running.ended));
  std::erase_if(m_running, [&](const auto& each) { return each.get() == &running; });
  if (m_running.empty()) m_interrupts.reset();
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
