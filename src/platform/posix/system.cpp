#include "platform/system.h"

#include <fcntl.h>
#include <malloc.h>
#include <pthread.h>
#include <sys/mman.h>
#include <sys/stat.h>
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
#include <thread>

#include "platform/file_system.h"

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

bool IsExecutableFile(const std::string& path) {
  struct stat status;
  return access(path.c_str(), X_OK) == 0 && stat(path.c_str(), &status) == 0 && S_ISREG(status.st_mode);
}

// The file that a name on PATH stands for; empty: none.
std::string PathOnPath(const std::string& program) {
  const std::string path = EnvironmentValue("PATH").value_or("");
  std::string_view rest = path;
  while (!rest.empty()) {
    const size_t end = std::min(rest.find(kPathListSeparator), rest.size());
    std::string candidate = std::string(rest.substr(0, end)) + "/" + program;
    if (IsExecutableFile(candidate)) return candidate;
    rest.remove_prefix(std::min(end + 1, rest.size()));
  }
  return {};
}

}  // namespace

const char kPathListSeparator = ':';

std::optional<std::string> EnvironmentValue(const char* name) {
  const char* const value = std::getenv(name);
  return value ? std::optional<std::string>(value) : std::nullopt;
}

void SetEnvironment(const std::string& name, const std::string& value) { setenv(name.c_str(), value.c_str(), 1); }

bool GoToFolder(const std::string& path) { return chdir(path.c_str()) == 0; }

void EndAtOnce(int status) { _exit(status); }

WorkingFolder::WorkingFolder() : m_handle(open(".", O_PATH | O_DIRECTORY | O_CLOEXEC)) {}

WorkingFolder::~WorkingFolder() {
  if (m_handle != kNoHandle) close(static_cast<int>(m_handle));
}

void WorkingFolder::Return() const { [[maybe_unused]] const int result = fchdir(static_cast<int>(m_handle)); }

size_t ProcessorCount() { return std::max(1u, std::thread::hardware_concurrency()); }

std::string FindProgram(const std::string& calledAs) {
  const std::string found = calledAs.find('/') == std::string::npos ? PathOnPath(calledAs) : calledAs;
  std::string path;
  return !found.empty() && RealPath(found, path) ? path : std::string();
}

bool CanRun(const std::string& calledAs) { return IsExecutableFile(FindProgram(calledAs)); }

std::vector<std::string> CommandLineWords(int count, char** words) { return {words, words + count}; }

std::string ProgramPath(const std::string& calledAs) {
  std::string path(PATH_MAX, '\0');
  const ssize_t length = readlink("/proc/self/exe", path.data(), path.size());
  if (length <= 0) return FindProgram(calledAs);
  path.resize(static_cast<size_t>(length));
  return path;
}

uint64_t CurrentThreadId() { return static_cast<uint64_t>(gettid()); }
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

namespace {

constexpr size_t kLeastStack = 8 << 20;
constexpr size_t kOneLevel = 1 << 20;  // more than one level of anything takes, under a sanitizer too
constexpr size_t kGuard = 4096;        // what overflows the stack ends here

thread_local uintptr_t stackBegin = 0;  // of the thread's own stack; 0: it has none of RunOnStack's

// Mapped here, as the library would have all of its memory promised at once. Null: no room, not even for the least one.
void* MapStack(size_t& bytes) {
  const size_t least = std::min(bytes, kLeastStack);
  for (;; bytes /= 2) {
    if (bytes < least) return nullptr;
    void* const stack =
        mmap(nullptr, bytes, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE | MAP_STACK, -1, 0);
    if (stack == MAP_FAILED) continue;
    mprotect(stack, kGuard, PROT_NONE);
    return stack;
  }
}

}  // namespace

bool RunOnStack(size_t bytes, const std::function<void()>& body) {
  void* const stack = MapStack(bytes);
  if (!stack) return false;
  struct Run {
    const std::function<void()>& body;
    void* stack;
    std::exception_ptr failure;
  } run{body, stack, nullptr};
  const auto start = [](void* argument) -> void* {
    Run& self = *static_cast<Run*>(argument);
    stackBegin = reinterpret_cast<uintptr_t>(self.stack) + kGuard;
    try {
      self.body();
    } catch (...) {
      self.failure = std::current_exception();
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
  if (run.failure) std::rethrow_exception(run.failure);
  return isRunning;
}

bool IsStackShort() {
  return stackBegin != 0 && reinterpret_cast<uintptr_t>(__builtin_frame_address(0)) < stackBegin + kOneLevel;
}

void SetSignals() {
  std::signal(SIGXFSZ, [](int) {});  // a handler, since tools would inherit that the signal is ignored
  std::signal(SIGCHLD, SIG_DFL);     // who ignores it, also by inheritance, does not learn how its tools ended
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
