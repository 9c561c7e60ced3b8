// Programs that this one runs, its tools: many at once, what each of them printed, and how it ended as a value.
//
// They are started through a process of its own, the keeper (platform/tool_keeper.h), which holds the folder locks of
// this one while a tool runs, and ends the tools with all that they started when this process is gone, however it
// ended. So no compiler that outlived its run writes over what a later run made.
//
// A tool's standard input is empty, and it holds no file that this program opened. What it prints comes through pipes,
// which are read while anything is waited for: kCapturedInMemory of each stream stays in memory, the rest goes to a
// file without a name. A tool counts as ended when it has ended itself: what it left behind (the server of a compiler
// cache) may go on, and is not waited for.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <deque>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace qrex::platform {

class ToolKeeper;

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
  int code = 0;                               // the exit status, or the signal's number
  StartFailure failure = StartFailure::None;  // of what could not be started at all

  bool IsNormal() const { return cause == Cause::Exited; }
  bool IsInterrupt() const;     // by the user, of the tool or, while it ran, of this process
  int InterpreterCode() const;  // as a command interpreter tells it: 126, 127, 128 and the signal; -1: not started
};

// A stream as it was captured.
class CapturedText {
 public:
  void Append(std::string_view bytes);
  void Break() { m_isWhole = false; }  // a part could not be read
  std::optional<std::string> Take();   // what was spilled is read back; none: a part is lost

 private:
  struct Close {
    void operator()(std::FILE* file) const { std::fclose(file); }
  };
  std::string m_text;
  std::unique_ptr<std::FILE, Close> m_spilled;
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
  size_t RunningCount() const { return m_running.size(); }
  // The next one that has ended, in the order of the ends. None: the time is over, or nothing runs.
  std::optional<Ended> WaitForAny(int milliseconds = kForever);
  Ended Run(const Program& program);  // to its end, whatever else runs
  // Ends what runs, with all that it started: asked first, forced after a moment. WaitForAny tells of each as of any.
  void EndAll();
  // Ends what runs, and waits until the keeper has released its locks. The next tool finds a new keeper.
  void Stop();

  static constexpr int kForever = -1;

 private:
  class Running;
  class InterruptWatch;

  bool Ask(const Program& program, Running& started, int& error);
  void ReadAndReap(int milliseconds);
  void ReapOne();
  void LoseKeeper();
  void End(Running& running, ProcessEnd end);

  std::vector<std::unique_ptr<Running>> m_running;
  std::deque<Ended> m_ended;
  std::unique_ptr<InterruptWatch> m_interrupts;  // while a tool runs
  std::unique_ptr<ToolKeeper> m_keeper;  // from the first tool on: it costs as much as a small run without tools
  Id m_nextId = 0;
};

}  // namespace qrex::platform
