// Programs that this one runs, its tools: many at once, what each of them printed, and how it ended as a value.
//
// When this process is gone, however it ended, the tools are ended with all that they started, so that no compiler that
// outlived its run writes over what a later run made. On POSIX systems a process of its own sees to that, the keeper
// (platform/posix/tool_keeper.h), which also holds the folder locks of this one while a tool runs; on Windows each tool
// has a job object.
//
// A tool's standard input is empty, and it holds no file that this program opened. What it prints comes through pipes,
// which are read while anything is waited for: kCapturedInMemory of each stream stays in memory, the rest goes to a
// file without a name. A tool counts as ended when it has ended itself: what it left behind (the server of a compiler
// cache) may go on, and is not waited for.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/streams.h"

namespace qrex::platform {

constexpr size_t kCapturedInMemory = 1 << 20;  // bytes

// What is run, in the folder in which the first tool was started and with the variables of this process: `words`, a
// program and its arguments, found on PATH unless it is a path; or, where there are none, a `line` for the command
// interpreter (platform/interpreter.h).
struct Program {
  enum class Stream { Inherited, Captured };

  std::vector<std::string> words = {};
  std::string line = {};
  Stream output = Stream::Inherited;
  Stream errors = Stream::Inherited;
  bool errorsIntoOutput = false;  // what is printed on both stays in its order
};

// How a program ended. A line whose interpreter did not find or could not run its program counts as these, one that
// tells of a signal as ended by it.
struct ProcessEnd {
  enum class Cause { Exited, EndedBySignal, NotFound, NotExecutable, NotStarted };
  enum class StartFailure { None, NotFound, TooLong, BadFormat, NoMemory, Other };

  Cause cause = Cause::Exited;
  int code = 0;                               // the exit status, or the number of the signal or exception
  StartFailure failure = StartFailure::None;  // of what could not be started at all

  bool IsNormal() const { return cause == Cause::Exited; }
  bool IsInterrupt() const;     // by the user, of the tool or, while it ran, of this process
  int InterpreterCode() const;  // as this system's interpreter tells it; -1: not started
  std::string EndedBy() const;  // "signal 9"
};

std::string TextOfTool(std::string text);  // as UTF-8, where the system has tools print other texts

// A stream as it was captured.
class CapturedText {
 public:
  void Append(std::string_view bytes);
  void Break() { m_isWhole = false; }  // a part could not be read
  std::optional<std::string> Take();   // what was spilled is read back; none: a part is lost

 private:
  std::string m_text;
  CStream m_spilled;
  bool m_isWhole = true;
};

// Whether the system starts a program with so many words, of that length, and leaves room for the variables that a
// program ahead of it may add.
bool FitsCommandLine(const std::vector<std::string>& words);

class Processes {
 public:
  using Id = uint32_t;  // of this object, from 0 up
  struct Ended {
    Id id = 0;
    ProcessEnd end;
    CapturedText output, errors;
  };

  Processes();
  ~Processes();
  Processes(const Processes&) = delete;
  Processes& operator=(const Processes&) = delete;

  Id Start(const Program& program);  // what cannot be started has ended at once, and says so
  size_t RunningCount() const;
  // The next one that has ended, in the order of the ends. None: the time is over, or nothing runs.
  std::optional<Ended> WaitForAny(int milliseconds = kForever);
  Ended Run(const Program& program);  // to its end, whatever else runs
  // Ends what runs, with all that it started: asked first, forced after a moment. WaitForAny tells of each as of any.
  void EndAll();
  // Ends what runs, and waits until nothing holds the locks of this process any more but itself.
  void Stop();

  static constexpr int kForever = -1;

 private:
  class Host;  // what the system below has for them

  void ReadAndReap(int milliseconds);  // waits until something can be read or has ended, once

  std::deque<Ended> m_ended;
  std::unique_ptr<Host> m_host;
  Id m_nextId = 0;
};

}  // namespace qrex::platform
