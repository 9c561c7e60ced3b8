// Clock, identifiers, the process itself.
#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace qrex::platform {

int64_t SystemFileTime();         // 100 ns units since 1601
uint64_t PerformanceCounter();    // monotonic
uint64_t PerformanceFrequency();  // counts per second

std::array<uint8_t, 16> MakeUuid();  // random, in network byte order

std::optional<std::string> EnvironmentValue(const char* name);
void SetEnvironment(const std::string& name, const std::string& value);
extern const char kPathListSeparator;  // between the entries of the process variable PATH

// The folder that the process works in, to come back to.
class WorkingFolder {
 public:
  WorkingFolder();
  ~WorkingFolder();
  WorkingFolder(const WorkingFolder&) = delete;
  WorkingFolder& operator=(const WorkingFolder&) = delete;
  void Return() const;

 private:
  const intptr_t m_handle;   // where the system below has one of it
  const std::string m_path;  // where it has none
};

bool GoToFolder(const std::string& path);  // the process works there from then on
[[noreturn]] void EndAtOnce(int status);   // whatever other threads wait for

// The words that this program was called with, as UTF-8.
std::vector<std::string> CommandLineWords(int count, char** words);
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
// From now on what fails is told to this process, where the system would end it or ask its user: a write beyond the
// limit of file sizes, a drive without a disk. And so are the ends of tools.
void SetSignals();
void TuneHeap();  // for a short run that fills much memory: take it in large steps

}  // namespace qrex::platform
