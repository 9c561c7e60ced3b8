#include "platform/posix/interpreter.h"

#include <algorithm>
#include <iterator>
#include <string_view>

#include "platform/file_system.h"
#include "platform/interpreter.h"
#include "platform/system.h"

namespace qrex::platform {

namespace {

// The batch file that marks a manifest's update is the one that this system has to carry out:
// `@echo TEXT >"FILE"`, with %TIME% and %DATE%.
int RunBatch(std::string path) {
  std::replace(path.begin(), path.end(), '\\', '/');
  std::string content;
  if (!ReadFile(path, content)) return 1;
  const size_t begin = content.find("@echo "), arrow = content.rfind(" >\""), end = content.rfind('"');
  if (begin != 0 || arrow == std::string::npos || end <= arrow + 3) return 1;
  std::string text = content.substr(6, arrow - 6);
  std::string target = content.substr(arrow + 3, end - arrow - 3);
  std::replace(target.begin(), target.end(), '\\', '/');
  const LocalTime now = CurrentLocalTime();
  auto replace = [&](std::string_view name, const std::string& value) {
    const size_t at = text.find(name);
    if (at != std::string::npos) text.replace(at, name.size(), value);
  };
  replace("%TIME%", std::to_string(now.hour) + ":" + std::to_string(now.minute) + ":" + std::to_string(now.second));
  replace("%DATE%", std::to_string(now.day) + "/" + std::to_string(now.month) + "/" + std::to_string(now.year));
  return !IsReadOnlyFile(target) && WriteFile(target, text + "\n") ? 0 : 1;
}

bool IsPlainInShell(char c) {
  return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || (c & 0x80) != 0 ||
         std::string_view("_@%+=:,./-").find(c) != std::string_view::npos;
}

bool IsBlank(char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; }
bool IsRedirection(std::string_view line) { return line.starts_with("1>") || line.starts_with("2>"); }

// The line for the shell, in which more characters have a meaning than in the interpreter that it was written for.
std::string ForShell(std::string_view line) {
  std::string text;
  bool isQuoted = false, isWordStart = true;
  for (; !line.empty(); line.remove_prefix(1)) {
    const char c = line.front();
    if (!isQuoted && isWordStart && IsRedirection(line)) {
      const size_t length = line.starts_with("2>&1") ? 4 : 2;
      text += line.substr(0, length);
      line.remove_prefix(length - 1);
      continue;
    }
    isWordStart = !isQuoted && IsBlank(c);
    if (line.starts_with("\\\"")) {  // a tool's own way to write a quote
      text += line.substr(0, 2);
      line.remove_prefix(1);
    } else if (c == '"') {
      text += c;
      isQuoted = !isQuoted;
    } else if (isWordStart) {
      text += ' ';
    } else {
      const bool hasMeaning =
          isQuoted ? std::string_view("$`\\").find(c) != std::string_view::npos : !IsPlainInShell(c);
      if (hasMeaning) text += '\\';
      text += c;
    }
  }
  return text;
}

// Names that mean something else to a shell than the program on PATH.
bool IsOfShell(std::string_view word) {
  static constexpr std::string_view kNames[] = {
      ".",       ":",        "[",       "alias", "bg",     "break", "builtin", "case",     "cd",     "chdir",
      "command", "continue", "do",      "done",  "echo",   "elif",  "else",    "esac",     "eval",   "exec",
      "exit",    "export",   "false",   "fc",    "fg",     "fi",    "for",     "getopts",  "hash",   "if",
      "jobs",    "kill",     "let",     "local", "printf", "pwd",   "read",    "readonly", "return", "set",
      "shift",   "source",   "test",    "then",  "time",   "times", "trap",    "true",     "type",   "typeset",
      "ulimit",  "umask",    "unalias", "unset", "until",  "wait",  "while"};
  return std::find(std::begin(kNames), std::end(kNames), word) != std::end(kNames);
}

std::string WithoutInterpreter(const std::string& line) {
  constexpr std::string_view kInterpreter = "cmd /c ";
  return line.starts_with(kInterpreter) ? line.substr(kInterpreter.size()) : line;
}

std::string WithNameHere(const std::string& line) {
  const std::string command = WithoutInterpreter(line);
  const size_t end = std::min(command.find(' '), command.size());
  return NameHere(command.substr(0, end)) + command.substr(end);
}

}  // namespace

std::string NameHere(const std::string& tool) {
  return tool == "gcc-4" && FindProgram(tool).empty() ? tool.substr(0, tool.find('-')) : tool;
}

std::string ForInterpreter(const std::string& line) { return ForShell(WithNameHere(line)); }

std::vector<std::string> WordsWithoutInterpreter(const std::string& line) {
  std::vector<std::string> words;
  std::string command = WithNameHere(line);
  bool isQuoted = false, isWithin = false;
  for (size_t at = 0; at < command.size(); ++at) {
    char c = command[at];
    if (!isQuoted && IsBlank(c)) {
      isWithin = false;
      continue;
    }
    if (!isWithin) {
      if (IsRedirection(std::string_view(command).substr(at))) return {};
      words.emplace_back();
      isWithin = true;
    }
    if (c == '"') {
      isQuoted = !isQuoted;
      continue;
    }
    if (c == '\\' && at + 1 < command.size() && command[at + 1] == '"') c = command[++at];
    words.back() += c;
  }
  if (isQuoted || words.empty()) return {};
  const std::string& program = words.front();
  const bool isAssignment = program.find('=') != std::string::npos;
  return isAssignment || IsOfShell(program) || !CanRun(program) ? std::vector<std::string>() : words;
}

bool IsBatchFile(const std::string& line) {
  constexpr std::string_view kEnd = ".bat\"";
  const std::string command = WithoutInterpreter(line);
  return command.starts_with('"') && command.size() > kEnd.size() + 1 && command.ends_with(kEnd);
}

int RunBatchFile(const std::string& line) {
  const std::string command = WithoutInterpreter(line);
  return RunBatch(command.substr(1, command.size() - 2));
}

}  // namespace qrex::platform
