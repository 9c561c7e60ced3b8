#include "platform/windows/interpreter.h"

#include <algorithm>
#include <iterator>
#include <string_view>

#include "platform/interpreter.h"
#include "platform/system.h"

namespace qrex::platform {

namespace {

bool IsBlank(char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; }
bool IsRedirection(std::string_view line) { return line.starts_with("1>") || line.starts_with("2>"); }
char Lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

std::string WithoutInterpreter(const std::string& line) {
  constexpr std::string_view kInterpreter = "cmd /c ";
  return line.starts_with(kInterpreter) ? line.substr(kInterpreter.size()) : line;
}

// The program's name, in quotes or not, and what stands behind it.
struct Parts {
  std::string program, rest;
};
Parts PartsOf(const std::string& command) {
  const bool isQuoted = command.starts_with('"');
  const size_t end = std::min(isQuoted ? command.find('"', 1) : command.find_first_of(" \t\r\n"), command.size());
  return {command.substr(isQuoted ? 1 : 0, end - (isQuoted ? 1 : 0)),
          command.substr(std::min(end + (isQuoted ? 1 : 0), command.size()))};
}

// Which the interpreter carries out itself.
bool IsOfInterpreter(std::string_view word) {
  static constexpr std::string_view kNames[] = {
      "assoc",    "break", "call",  "cd",     "chdir", "cls",  "color", "copy",   "date",   "del",    "dir",
      "echo",     "erase", "exit",  "for",    "ftype", "goto", "if",    "md",     "mkdir",  "mklink", "move",
      "path",     "pause", "popd",  "prompt", "pushd", "rd",   "rem",   "ren",    "rename", "rmdir",  "set",
      "setlocal", "shift", "start", "time",   "title", "type", "ver",   "verify", "vol"};
  std::string name(word);
  std::transform(name.begin(), name.end(), name.begin(), Lower);
  return std::find(std::begin(kNames), std::end(kNames), name) != std::end(kNames);
}

bool Redirects(std::string_view line) {
  bool isQuoted = false, isWordStart = true;
  for (; !line.empty(); line.remove_prefix(1)) {
    if (!isQuoted && isWordStart && IsRedirection(line)) return true;
    if (line.front() == '"') isQuoted = !isQuoted;
    isWordStart = IsBlank(line.front());
  }
  return false;
}

bool IsProgramFile(std::string path) {
  std::transform(path.begin(), path.end(), path.begin(), Lower);
  return path.ends_with(".exe") || path.ends_with(".com");
}

std::string InterpreterPath() { return EnvironmentValue("COMSPEC").value_or("C:\\windows\\system32\\cmd.exe"); }

// /s has it take away just the outermost quotes, /d has it run nothing else first.
Call Interpreted(const std::string& line) {
  const std::string path = InterpreterPath();
  return {path, "\"" + path + "\" /d /s /c \"" + ForInterpreter(line) + "\"", true, false};
}

}  // namespace

std::string NameHere(const std::string& tool) {
  return tool == "gcc-4" && FindProgram(tool).empty() ? tool.substr(0, tool.find('-')) : tool;
}

// A percent sign can't be escaped in quotes: there they end for it.
std::string ForInterpreter(const std::string& line) {
  std::string text;
  bool isQuoted = false, isWordStart = true;
  for (std::string_view rest = line; !rest.empty(); rest.remove_prefix(1)) {
    const char c = rest.front();
    if (!isQuoted && isWordStart && IsRedirection(rest)) {
      const size_t length = rest.starts_with("2>&1") ? 4 : 2;
      text += rest.substr(0, length);
      rest.remove_prefix(length - 1);
      continue;
    }
    isWordStart = !isQuoted && IsBlank(c);
    if (c == '"') {
      isQuoted = !isQuoted;
      text += c;
    } else if (c == '%') {
      text += isQuoted ? "\"^%\"" : "^%";
    } else if (!isQuoted && std::string_view("&|<>^()").find(c) != std::string_view::npos) {
      text.append({'^', c});
    } else {
      text += IsBlank(c) ? ' ' : c;
    }
  }
  return text;
}

// Backslashes are doubled where a quote follows: there they have a meaning.
std::string AsOneLine(const std::vector<std::string>& words) {
  std::string line;
  for (const std::string& word : words) {
    if (!line.empty()) line += ' ';
    if (!word.empty() && word.find_first_of(" \t\r\n\v\"") == std::string::npos) {
      line += word;
      continue;
    }
    line += '"';
    size_t backslashes = 0;
    for (const char c : word) {
      if (c == '"') line.append(backslashes + 1, '\\');
      backslashes = c == '\\' ? backslashes + 1 : 0;
      line += c;
    }
    line.append(backslashes, '\\').append("\"");
  }
  return line;
}

Call CallOfLine(const std::string& line) {
  const std::string command = WithoutInterpreter(line);
  Parts parts = PartsOf(command);
  parts.program = NameHere(parts.program);
  if (IsOfInterpreter(parts.program)) return Interpreted(command);
  std::string found = FindProgram(parts.program);
  const std::string text = "\"" + parts.program + "\"" + parts.rest;
  if (IsProgramFile(found) && !Redirects(parts.rest)) return {found, text, false, false};
  if (found.empty()) {
    Call unknown = Interpreted(PartsOf(command).program == parts.program ? command : text);
    unknown.isUnknown = true;
    return unknown;
  }
  // It takes a slash for the begin of an option.
  std::replace(found.begin(), found.end(), '/', '\\');
  return Interpreted("\"" + found + "\"" + parts.rest);
}

Call CallOfWords(const std::vector<std::string>& words) {
  const std::string found = FindProgram(words.front());
  if (found.empty() || IsProgramFile(found)) return {found, AsOneLine(words), false, false};
  std::vector<std::string> asFound = words;
  asFound.front() = found;
  std::replace(asFound.front().begin(), asFound.front().end(), '/', '\\');
  return Interpreted(AsOneLine(asFound));
}

}  // namespace qrex::platform
