#include "text/trace.h"

#include <mutex>

#include "platform/buffered_file.h"
#include "platform/console.h"
#include "platform/system.h"
#include "text/exceptions.h"

namespace qrex {

namespace {

constexpr size_t kMaxPending = 16384;

thread_local int64_t traceIndent = 0;
bool stampLines = false;
TraceHook* traceHook = nullptr;
std::string* heldTrace = nullptr;
int quietConsoles = 0;

// Keeps what comes before a target exists, up to a bound.
class TraceSink {
 public:
  bool Open(const std::string& path, bool append) {
    std::lock_guard lock(m_lock);
    m_toStdout = path == "stdout";
    m_file.Close();
    if (!m_toStdout) m_file.Open(path, append ? "a" : "w");
    if (!HasTarget()) return false;
    const std::string pending = std::move(m_pending);
    m_pending.clear();
    if (!pending.empty()) Put(pending);
    return true;
  }

  void Close() {
    std::lock_guard lock(m_lock);
    m_toStdout = false;
    m_file.Close();
    m_pending.clear();
  }

  void Write(std::string_view text) {
    std::lock_guard lock(m_lock);
    if (HasTarget()) {
      Put(text);
    } else {
      if (traceHook) traceHook->OnTrace(text);
      if (m_pending.size() < kMaxPending) m_pending += text;
    }
  }

 private:
  bool HasTarget() const { return m_toStdout || m_file.IsOpen(); }

  // Never throws: it runs at the end of a TraceWriter.
  void Put(std::string_view text) {
    if (traceHook) traceHook->OnTrace(text);
    if (m_toStdout) {
      platform::WriteStdout(platform::IsValidUtf8(text) ? std::string(text) : platform::WidenBytes(text));
    } else {
      m_file.Write(text);
      m_file.Flush();
    }
  }

  std::mutex m_lock;
  bool m_toStdout = false;
  platform::BufferedFile m_file;
  std::string m_pending;
};

TraceSink& Sink() {
  static TraceSink sink;
  return sink;
}

std::string Padded(int value, size_t width) {
  std::string digits = std::to_string(value);
  return std::string(width > digits.size() ? width - digits.size() : 0, '0') + digits;
}

std::string LineStamp() {
  const platform::LocalTime now = platform::CurrentLocalTime();
  return std::to_string(platform::CurrentThreadId()) + " " + Padded(now.day, 2) + "/" + Padded(now.month, 2) + "/" +
         Padded(now.year, 4) + " " + Padded(now.hour, 2) + ":" + Padded(now.minute, 2) + ":" + Padded(now.second, 2) +
         "." + Padded(now.millisecond, 3) + " ";
}

std::string WithLinePrefix(std::string_view text) {
  const std::string prefix = (stampLines ? LineStamp() : std::string()) +
                             std::string(traceIndent > 0 ? static_cast<size_t>(traceIndent) : 0, ' ');
  std::string result;
  bool atLineStart = true;
  for (char c : text) {
    if (atLineStart && c != '\n') result += prefix;
    atLineStart = c == '\n';
    result += c;
  }
  return result;
}

}  // namespace

bool OpenTrace(const std::string& path, bool append, bool stamp) {
  stampLines = stamp;
  return Sink().Open(path, append);
}

void CloseTrace() { Sink().Close(); }
void SetTraceHook(TraceHook* hook) { traceHook = hook; }

void WriteToTrace(std::string_view text) {
  std::string prefixed;
  if (traceIndent > 0 || stampLines) text = prefixed = WithLinePrefix(text);
  if (heldTrace) {
    *heldTrace += text;
  } else {
    Sink().Write(text);
  }
}

void HoldTrace(std::string* held) { heldTrace = held; }
void WriteHeldToTrace(std::string_view text) { Sink().Write(text); }

QuietConsole::QuietConsole() { ++quietConsoles; }
QuietConsole::~QuietConsole() { --quietConsoles; }

void WriteToConsole(std::string_view text) {
  if (quietConsoles > 0) return;
  if (platform::IsValidUtf8(text)) return platform::WriteStdout(text);
  if (!platform::StdoutIsTerminal()) throw StringConversionException();
  platform::WriteStdout(platform::WidenBytes(text));
}

std::string Hint(std::string_view text) {
  if (text.empty() || !platform::StdoutIsTerminal()) return {};
  return "    hint: " + std::string(text) + "\n";
}

TraceIndentScope::TraceIndentScope(int64_t columns) : m_columns(columns) { traceIndent += columns; }
TraceIndentScope::~TraceIndentScope() { traceIndent -= m_columns; }

}  // namespace qrex
