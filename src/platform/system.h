// Clock, identifiers, processes.
#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <string>

namespace qrex::platform {

class ToolKeeper;

int64_t SystemFileTime();         // 100 ns units since 1601
uint64_t PerformanceCounter();    // monotonic
uint64_t PerformanceFrequency();  // counts per second

std::array<uint8_t, 16> MakeUuid();  // random, in network byte order

// Runs a line through the command interpreter; its exit code. "cmd /c REST" runs REST. The line has the form of that
// interpreter: "..." is taken as it stands, and outside of it 1>FILE, 2>FILE and 2>&1 redirect; nothing else has a
// meaning, so that a line runs the one tool that it begins with.
int RunCommand(ToolKeeper& tools, const std::string& line);
void SetEnvironment(const std::string& name, const std::string& value);
constexpr char kPathListSeparator = ':';  // between the entries of the process variable PATH

std::string ProgramPath();  // of this program, with symbolic links resolved; empty where the system does not tell
uint64_t CurrentThreadId();
uint64_t CurrentProcessId();
bool IsProcessRunning(uint64_t id);
struct LocalTime {
  int day, month, year, hour, minute, second, millisecond;
};
LocalTime CurrentLocalTime();

// Runs `body` to its end on a stack of the given size; memory is only used as the stack grows. Exceptions go on.
void RunOnStack(size_t bytes, const std::function<void()>& body);
// From now on a write beyond the user's limit of file sizes fails, where it would end the process, and the ends of
// tools are told.
void SetSignals();
void TuneHeap();  // for a short run that fills much memory: take it in large steps

}  // namespace qrex::platform
