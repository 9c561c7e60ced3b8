// The process-wide trace log: every TraceWriter ends here.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace qrex {

class TraceHook {
 public:
  virtual ~TraceHook() = default;
  virtual void OnTrace(std::string_view text) = 0;
};

bool OpenTrace(const std::string& path, bool append, bool stampLines);  // "stdout" selects standard output
void CloseTrace();
void SetTraceHook(TraceHook* hook);        // not owned; null removes it. Tests capture messages through it
void WriteToTrace(std::string_view text);  // what a TraceWriter's end calls
// What is written from now on is added there instead, for whoever has to bring it into an order; null: to the log.
void HoldTrace(std::string* held);
void WriteHeldToTrace(std::string_view text);  // what was held

// Writes to standard output as UTF-8 through the console writer, unbuffered by the tool.
void WriteToConsole(std::string_view text);
// While one is alive, nothing reaches standard output: neither this way nor through a trace log that ends there.
class QuietConsole {
 public:
  QuietConsole();
  ~QuietConsole();
  QuietConsole(const QuietConsole&) = delete;
  QuietConsole& operator=(const QuietConsole&) = delete;
};

// The line of a hint, to be written behind a message on a terminal; empty where a pipe or a file takes the output,
// which holds messages alone.
std::string Hint(std::string_view text);

class TraceIndentScope {
 public:
  explicit TraceIndentScope(int64_t columns);
  ~TraceIndentScope();

 private:
  int64_t m_columns;
};

}  // namespace qrex
