// The process-wide trace log: every TraceWriter ends here.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

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

// Writes to standard output as UTF-8 through the console writer, unbuffered by the tool.
void WriteToConsole(std::string_view text);

// What a thread wrote to trace log and console inside of a Scope, in order.
class HeldOutput {
 public:
  class Scope {
   public:
    explicit Scope(HeldOutput& output);
    ~Scope();
    Scope(const Scope&) = delete;
    Scope& operator=(const Scope&) = delete;

   private:
    HeldOutput* m_outer;
  };
  void AddToTrace(std::string_view text);
  void AddToConsole(std::string_view text);
  void Write() const;  // to where it was meant for

 private:
  struct Piece {
    bool isTrace;
    std::string text;
  };
  void Add(bool isTrace, std::string_view text);
  std::vector<Piece> m_pieces;
};

class TraceIndentScope {
 public:
  explicit TraceIndentScope(int64_t columns);
  ~TraceIndentScope();

 private:
  int64_t m_columns;
};

}  // namespace qrex
