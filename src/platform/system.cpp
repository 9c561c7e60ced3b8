#include "platform/system.h"

#include <pthread.h>
#include <sys/wait.h>
#include <unistd.h>

#include <boost/uuid/random_generator.hpp>
#include <boost/uuid/uuid.hpp>
#include <chrono>
#include <cstdlib>
#include <ctime>
#include <exception>
#include <string_view>

namespace qrex::platform {

namespace {

constexpr int64_t kUnixEpoch = 116444736000000000;

timespec Now(clockid_t clock) {
  timespec now;
  clock_gettime(clock, &now);
  return now;
}

struct StackRun {
  const std::function<void()>& body;
  std::exception_ptr failure;
};

void* RunBody(void* argument) {
  auto& run = *static_cast<StackRun*>(argument);
  try {
    run.body();
  } catch (...) {
    run.failure = std::current_exception();
  }
  return nullptr;
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

std::array<uint8_t, 16> MakeUuid() {
  static boost::uuids::random_generator generate;
  const boost::uuids::uuid made = generate();
  std::array<uint8_t, 16> bytes;
  std::copy(made.begin(), made.end(), bytes.begin());
  return bytes;
}

int RunCommand(const std::string& line) {
  constexpr std::string_view kInterpreter = "cmd /c ";
  const bool isWrapped = line.compare(0, kInterpreter.size(), kInterpreter) == 0;
  const int status = std::system(isWrapped ? line.c_str() + kInterpreter.size() : line.c_str());
  if (status == -1) return -1;
  return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

void SetEnvironment(const std::string& name, const std::string& value) { setenv(name.c_str(), value.c_str(), 1); }

uint64_t CurrentThreadId() { return static_cast<uint64_t>(gettid()); }

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

void RunOnStack(size_t bytes, const std::function<void()>& body) {
  StackRun run{body, nullptr};
  pthread_attr_t attributes;
  pthread_attr_init(&attributes);
  pthread_attr_setstacksize(&attributes, bytes);
  pthread_t thread;
  const bool started = pthread_create(&thread, &attributes, RunBody, &run) == 0;
  pthread_attr_destroy(&attributes);
  if (started) {
    pthread_join(thread, nullptr);
  } else {
    body();  // no memory for it: the stack at hand serves
  }
  if (run.failure) std::rethrow_exception(run.failure);
}

}  // namespace qrex::platform
