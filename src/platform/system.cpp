#include "platform/system.h"

#include <malloc.h>
#include <pthread.h>
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <boost/uuid/random_generator.hpp>
#include <boost/uuid/uuid.hpp>
#include <cerrno>
#include <chrono>
#include <climits>
#include <csignal>
#include <cstdlib>
#include <ctime>
#include <exception>
#include <string_view>

#include "platform/console.h"
#include "platform/file_system.h"
#include "platform/tool_keeper.h"

namespace qrex::platform {

namespace {

constexpr int64_t kUnixEpoch = 116444736000000000;

timespec Now(clockid_t clock) {
  timespec now;
  clock_gettime(clock, &now);
  return now;
}

}  // namespace

int64_t SystemFileTime() {
  const timespec now = Now(CLOCK_REALTIME);
  return kUnixEpoch + now.tv_sec * 10000000 + now.tv_nsec / 100;
}

uint64_t PerformanceCounter() {
  const timespec now = Now(CLOCK_MONOTONIC);
  return static_cast<uint64_t>(now.tv_sec) * 1000000000 + static_cast<uint64_t>(now.tv_nsec);
}

uint64_t PerformanceFrequency() { return 1000000000; }

namespace {

// The system's own random numbers, many at a time.
class RandomNumbers {
 public:
  using result_type = uint32_t;
  static constexpr result_type min() { return 0; }
  static constexpr result_type max() { return UINT32_MAX; }
  result_type operator()() {
    if (m_used == m_numbers.size()) {
      boost::uuids::detail::random_provider().get_random_bytes(m_numbers.data(), sizeof m_numbers);
      m_used = 0;
    }
    return m_numbers[m_used++];
  }

 private:
  std::array<result_type, 256> m_numbers;
  size_t m_used = m_numbers.size();
};

}  // namespace

std::array<uint8_t, 16> MakeUuid() {
  static RandomNumbers numbers;
  static boost::uuids::basic_random_generator<RandomNumbers> generate(numbers);
  const boost::uuids::uuid made = generate();
  std::array<uint8_t, 16> bytes;
  std::copy(made.begin(), made.end(), bytes.begin());
  return bytes;
}

namespace {

bool IsOnPath(const std::string& program) {
  const char* path = std::getenv("PATH");
  std::string_view rest = path ? path : "";
  while (!rest.empty()) {
    const size_t end = std::min(rest.find(kPathListSeparator), rest.size());
    if (access((std::string(rest.substr(0, end)) + "/" + program).c_str(), X_OK) == 0) return true;
    rest.remove_prefix(std::min(end + 1, rest.size()));
  }
  return false;
}

// The batch file that marks a manifest's update is the one that this system has to carry out:
// `@echo TEXT >"FILE"`, with %TIME% and %DATE%.
int RunBatchFile(std::string path) {
  std::replace(path.begin(), path.end(), '\\', '/');
  std::string content;
  if (!ReadFile(path, content)) return 1;
  const size_t begin = content.find("@echo "), arrow = content.rfind(" >\""), end = content.rfind('"');
  if (begin != 0 || arrow == std::string::npos || end <= arrow + 3) return 1;
  std::string text = content.substr(6, arrow - 6);
  std::string target = content.substr(arrow + 3, end - arrow - 3);
  std::replace(target.begin(), target.end(), '\\', '/');
  const LocalTime now = CurrentLocalTime();
  auto replace = [&](std::string_view name, const std::string& value) {
    const size_t at = text.find(name);
    if (at != std::string::npos) text.replace(at, name.size(), value);
  };
  replace("%TIME%", std::to_string(now.hour) + ":" + std::to_string(now.minute) + ":" + std::to_string(now.second));
  replace("%DATE%", std::to_string(now.day) + "/" + std::to_string(now.month) + "/" + std::to_string(now.year));
  return !IsReadOnlyFile(target) && WriteFile(target, text + "\n") ? 0 : 1;
}

bool IsPlainInShell(char c) {
  return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || (c & 0x80) != 0 ||
         std::string_view("_@%+=:,./-").find(c) != std::string_view::npos;
}

// The line for the shell, in which more characters have a meaning than in the interpreter that it was written for.
std::string ForShell(std::string_view line) {
  std::string text;
  bool isQuoted = false, isWordStart = true;
  for (; !line.empty(); line.remove_prefix(1)) {
    const char c = line.front();
    if (!isQuoted && isWordStart && (line.starts_with("1>") || line.starts_with("2>"))) {
      const size_t length = line.starts_with("2>&1") ? 4 : 2;
      text += line.substr(0, length);
      line.remove_prefix(length - 1);
      continue;
    }
    isWordStart = !isQuoted && (c == ' ' || c == '\t' || c == '\n' || c == '\r');
    if (line.starts_with("\\\"")) {  // a tool's own way to write a quote
      text += line.substr(0, 2);
      line.remove_prefix(1);
    } else if (c == '"') {
      text += c;
      isQuoted = !isQuoted;
    } else if (isWordStart) {
      text += ' ';
    } else {
      const bool hasMeaning =
          isQuoted ? std::string_view("$`\\").find(c) != std::string_view::npos : !IsPlainInShell(c);
      if (hasMeaning) text += '\\';
      text += c;
    }
  }
  return text;
}

}  // namespace

int RunCommand(ToolKeeper& tools, const std::string& line) {
  constexpr std::string_view kInterpreter = "cmd /c ";
  constexpr std::string_view kCompiler = "gcc-4 ";
  constexpr std::string_view kBatchEnd = ".bat\"";
  std::string command =
      line.compare(0, kInterpreter.size(), kInterpreter) == 0 ? line.substr(kInterpreter.size()) : line;
  if (command.compare(0, kCompiler.size(), kCompiler) == 0 && !IsOnPath("gcc-4")) command.erase(3, 2);
  if (command.size() > kBatchEnd.size() + 1 && command.front() == '"' &&
      command.compare(command.size() - kBatchEnd.size(), kBatchEnd.size(), kBatchEnd) == 0) {
    return RunBatchFile(command.substr(1, command.size() - 2));
  }
  FlushStdout();
  return tools.Run(ForShell(command));
}

void SetEnvironment(const std::string& name, const std::string& value) { setenv(name.c_str(), value.c_str(), 1); }

std::string ProgramPath() {
  std::string path(PATH_MAX, '\0');
  const ssize_t length = readlink("/proc/self/exe", path.data(), path.size());
  path.resize(length > 0 ? static_cast<size_t>(length) : 0);
  return path;
}

uint64_t CurrentThreadId() { return static_cast<uint64_t>(gettid()); }
uint64_t CurrentProcessId() { return static_cast<uint64_t>(getpid()); }
bool IsProcessRunning(uint64_t id) { return kill(static_cast<pid_t>(id), 0) == 0 || errno == EPERM; }

LocalTime CurrentLocalTime() {
  const timespec now = Now(CLOCK_REALTIME);
  tm local;
  localtime_r(&now.tv_sec, &local);
  return {local.tm_mday,
          local.tm_mon + 1,
          local.tm_year + 1900,
          local.tm_hour,
          local.tm_min,
          local.tm_sec,
          static_cast<int>(now.tv_nsec / 1000000)};
}

// The stack of a thread of its own. It is mapped here, as the library would have all of its memory promised at once.
void RunOnStack(size_t bytes, const std::function<void()>& body) {
  void* const stack =
      mmap(nullptr, bytes, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE | MAP_STACK, -1, 0);
  if (stack == MAP_FAILED) return body();  // no room for it: the stack of the caller serves
  mprotect(stack, 4096, PROT_NONE);        // what overflows it ends here
  struct Run {
    const std::function<void()>& body;
    std::exception_ptr failure;
  } run{body, nullptr};
  const auto start = [](void* argument) -> void* {
    Run& run = *static_cast<Run*>(argument);
    try {
      run.body();
    } catch (...) {
      run.failure = std::current_exception();
    }
    return nullptr;
  };
  pthread_attr_t attributes;
  pthread_attr_init(&attributes);
  pthread_attr_setstack(&attributes, stack, bytes);
  pthread_t thread;
  const bool isRunning = pthread_create(&thread, &attributes, start, &run) == 0;
  pthread_attr_destroy(&attributes);
  if (isRunning) pthread_join(thread, nullptr);
  munmap(stack, bytes);
  if (!isRunning) return body();
  if (run.failure) std::rethrow_exception(run.failure);
}

void SetSignals() {
  std::signal(SIGXFSZ, [](int) {});  // a handler, since tools would inherit that the signal is ignored
  std::signal(SIGCHLD, SIG_DFL);     // who ignores it, also by inheritance, is not told how its tools ended
}

// The heap begins with a step that holds most runs, in large pages: to be given memory page by page took up to half of
// a run's time. What lies before the first large page that is untouched so far is left alone. Large blocks come from
// the heap too.
void TuneHeap() {
  constexpr int kFirstStep = 256 << 20, kStep = 16 << 20;
  constexpr uintptr_t kLargePage = 2 << 20;
  [[maybe_unused]] static void* volatile gap;  // kept; volatile, or the compiler would leave the call out
  mallopt(M_ARENA_MAX, 1);                     // for all threads
  mallopt(M_TRIM_THRESHOLD, 4 * kFirstStep - 1);
  mallopt(M_MMAP_THRESHOLD, 32 << 20);
  mallopt(M_TOP_PAD, kFirstStep);
  if (void* const begin = std::malloc(kLargePage)) {  // behind it the heap's own mark has touched a page
    const uintptr_t pastLargePage = reinterpret_cast<uintptr_t>(begin) % kLargePage;
    PreferLargePages(begin, kFirstStep);
    std::free(begin);
    gap = std::malloc(2 * kLargePage - pastLargePage);
  }
  mallopt(M_TOP_PAD, kStep);
}

}  // namespace qrex::platform
