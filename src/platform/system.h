// Clock, identifiers, the process itself.
#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>

namespace qrex::platform {

int64_t SystemFileTime();         // 100 ns units since 1601
uint64_t PerformanceCounter();    // monotonic
uint64_t PerformanceFrequency();  // counts per second

std::array<uint8_t, 16> MakeUuid();  // random, in network byte order

std::optional<std::string> EnvironmentValue(const char* name);
void SetEnvironment(const std::string& name, const std::string& value);
constexpr char kPathListSeparator = ':';  // between the entries of the process variable PATH

// The folder that the process works in, to come back to.
class WorkingFolder {
 public:
  WorkingFolder();
  ~WorkingFolder();
  WorkingFolder(const WorkingFolder&) = delete;
  WorkingFolder& operator=(const WorkingFolder&) = delete;
  void Return() const;

 private:
  const int m_descriptor;
};

bool GoToFolder(const std::string& path);  // the process works there from then on
[[noreturn]] void EndAtOnce(int status);   // whatever other threads wait for

// Of this program, with symbolic links resolved. Where the system does not tell, it is found by the first word of its
// command line: a path, or a name on PATH; empty: not found.
std::string ProgramPath(const std::string& calledAs);
size_t ProcessorCount();                               // that this process may use; at least 1
std::string FindProgram(const std::string& calledAs);  // by that word alone
bool CanRun(const std::string& calledAs);              // that program
uint64_t CurrentThreadId();
bool IsProcessRunning(uint64_t id);
struct LocalTime {
  int day, month, year, hour, minute, second, millisecond;
};
LocalTime CurrentLocalTime();

// Runs `body` to its end on a stack of the given size, or of the largest part of it that there is room for; memory is
// only used as the stack grows. Exceptions go on. False: there is no room for the least stack that serves.
bool RunOnStack(size_t bytes, const std::function<void()>& body);
// Whether that stack may not hold another level of what is nested. What recurses as deep as its input asks here.
bool IsStackShort();
// From now on a write beyond the user's limit of file sizes fails, where it would end the process, and the ends of
// tools are reported to it.
void SetSignals();
void TuneHeap();  // for a short run that fills much memory: take it in large steps

}  // namespace qrex::platform
