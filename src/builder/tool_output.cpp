#include "builder/tool_output.h"

#include <algorithm>
#include <optional>
#include <utility>

#include "builder/build_observer.h"
#include "builder/tool_colours.h"
#include "text/files.h"
#include "text/paths.h"

namespace qrex {

namespace {

bool IsBlank(char c) { return c == ' ' || c == '\t'; }
bool IsDigit(char c) { return c >= '0' && c <= '9'; }
bool StandsInFileName(char c) { return std::string_view("\n\r\"*<>?|").find(c) == std::string_view::npos; }

bool StartsWith(std::string_view text, std::string_view prefix) { return text.substr(0, prefix.size()) == prefix; }

bool StripIgnoringCase(std::string& path, const std::string& prefix) {
  if (!StartsWithIgnoringCase(path, prefix)) return false;
  path.erase(0, prefix.size());
  return true;
}

constexpr size_t kLongestPath = 32'767;           // of any system; beyond it comes a line of many messages
constexpr int64_t kLastLine = 1'000'000'000'000;  // no file is longer; further digits of a number are only passed over

// A message in a line: where the file name ends, the number, and the text behind.
struct MessageInLine {
  std::string_view file;
  int64_t line = 0;
  std::string_view rest;
  size_t end = 0;  // behind the number, where the walk goes on
};

class OutputScanner {
 public:
  OutputScanner(const BuildFiles& builder, std::string_view launcher) : m_builder(builder), m_launcher(launcher) {
    FullPathOf(".", m_currentDirectory);
    if (!m_currentDirectory.ends_with('/')) m_currentDirectory += '/';
  }

  ToolMessages Scan(std::string_view text) {
    while (!text.empty()) {
      const size_t end = std::min(text.find('\n'), text.size());
      const std::string_view line = text.substr(0, end);
      const std::optional<size_t> message = ScanLine(line);
      if (m_builder.settings.coloursToolMessages) {
        m_trace << ColouredLine(line, message);
      } else {
        m_trace << line;
      }
      if (end < text.size()) m_trace << "\n";
      text.remove_prefix(std::min(end + 1, text.size()));
    }
    return m_found;
  }

 private:
  // Where the text of its first message begins.
  std::optional<size_t> ScanLine(std::string_view line) {
    std::optional<size_t> first;
    const size_t begin = line.find_first_not_of(" \t\v\f\r");
    if (begin == std::string_view::npos || IsOfLauncher(line.substr(begin))) return first;
    for (size_t at = begin; at < line.size() && StandsInFileName(line[at]);) {
      MessageInLine message;
      if (ReadMessage(line, begin, at, message)) {
        const bool isCounted = Count(message.rest);
        const SourcePlace source = PointAtSource(line.substr(0, begin), message);
        if (isCounted && m_builder.settings.observer) TellObserver(message, source);
        if (isCounted && !first) first = static_cast<size_t>(message.rest.data() - line.data());
        at = message.end;
      } else {
        ++at;
      }
    }
    return first;
  }

  void TellObserver(const MessageInLine& message, const SourcePlace& source) const {
    ToolMessage told;
    told.severity = StartsWith(message.rest, "error") ? Severity::Error : Severity::Warning;
    told.text = message.rest;
    told.place = {std::string(message.file), message.line};
    if (!source.file.empty()) told.generated = std::exchange(told.place, source);
    m_builder.settings.observer->Take(told);
  }

  // Launchers name themselves, at times with a process number: "distcc[17] ...", "ccache: ...".
  bool IsOfLauncher(std::string_view line) const {
    if (m_launcher.empty() || !StartsWithIgnoringCase(line, m_launcher) || line.size() == m_launcher.size())
      return false;
    const char behind = line[m_launcher.size()];
    return behind == '[' || behind == ':';
  }

  // Is the number of a message behind the `(` or `:` at `at`?
  bool ReadMessage(std::string_view line, size_t begin, size_t at, MessageInLine& message) const {
    const char opening = line[at];
    const bool isColonForm = opening == ':' && IsGccFamily(m_builder.settings.compiler);
    if (opening != '(' && !isColonForm) return false;
    size_t next = at + 1;
    for (; next < line.size() && IsDigit(line[next]); ++next) {
      if (message.line < kLastLine) message.line = message.line * 10 + (line[next] - '0');
    }
    if (next == at + 1) return false;
    message.file = line.substr(begin, at - begin);
    auto skipBlanks = [&] {
      while (next < line.size() && IsBlank(line[next])) ++next;
    };
    auto take = [&](char c) { return next < line.size() && line[next] == c && ++next > 0; };
    if (isColonForm) {
      if (!take(':')) return false;
      size_t column = next;
      while (column < line.size() && IsDigit(line[column])) ++column;
      if (column > next && column < line.size() && line[column] == ':') next = column + 1;
      skipBlanks();
      message.rest = line.substr(next);
      if (StartsWith(message.rest, "fatal error")) message.rest.remove_prefix(6);
      if (!StartsWith(message.rest, "error") && !StartsWith(message.rest, "warning")) return false;
    } else {
      if (!take(')')) return false;
      skipBlanks();
      if (!take(':')) return false;
      skipBlanks();
      message.rest = line.substr(next);
    }
    message.end = next;
    return true;
  }

  bool Count(std::string_view rest) {
    const bool isError = StartsWith(rest, "error"), isWarning = StartsWith(rest, "warn");
    m_found.errors += isError;
    m_found.warnings += isWarning;
    return isError || isWarning;
  }

  SourcePlace PointAtSource(std::string_view indentation, const MessageInLine& message) {
    if (message.file.size() > kLongestPath) return {};
    // A compiler tells how it came to a file: from here or not, with `.` and `..` as its include paths have them.
    std::string file(message.file);
    std::replace(file.begin(), file.end(), '\\', '/');
    if (!IsAbsolutePath(file)) {
      file.insert(0, m_currentDirectory);
    } else if (file.front() == '/') {
      file.insert(0, DriveOf(m_currentDirectory));  // which goes without saying
    }
    file = CollapseDots(file);
    StripIgnoringCase(file, m_currentDirectory);
    if (!StripIgnoringCase(file, TranslationDirectory(m_builder.config))) return {};
    if (!file.empty() && file.front() == '/') file.erase(0, 1);
    auto found = m_builder.scannedByPath.find(file);
    std::string path;
    int64_t line;
    if (found == m_builder.scannedByPath.end() || !found->second->MapGeneratedLine(message.line, m_trace, path, line)) {
      return {};
    }
    m_trace << indentation << path << "(" << line << ") ...\n";
    return {path, line};
  }

  const BuildFiles& m_builder;
  const std::string_view m_launcher;
  std::string m_currentDirectory;  // with a slash at the end
  TraceWriter m_trace;
  ToolMessages m_found;
};

}  // namespace

ToolMessages ScanToolOutput(const BuildFiles& builder, std::string_view text, std::string_view launcher) {
  return OutputScanner(builder, launcher).Scan(text);
}

}  // namespace qrex
