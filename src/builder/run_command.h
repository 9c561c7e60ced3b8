// Starting a tool, through the command interpreter or by its words, and what is said of how it ended.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "text/files.h"
#include "workspace/config_settings.h"

namespace qrex {

struct Command {
  std::string line;
  std::vector<std::string> words = {};  // run without the interpreter; the line is what is told of them
  bool echo = false;
  bool capturesOutput = false;
  bool capturesErrors = false;
  bool errorsIntoOutput = false;   // the error stream joins the captured output
  bool showsOutputBehind = false;  // what is not captured is printed once the tool has ended
  bool failOnNonZero = false;
  bool failOnErrorText = false;
};

struct CommandResult {
  bool succeeded = false;  // else it could not be run, or failed as the command says; the trace log has told why
  platform::ProcessEnd end;
  std::string output, errors;  // as captured
  int ReturnCode() const { return end.InterpreterCode(); }
};

platform::Processes::Id StartCommand(platform::Processes& tools, const Command& command);
// Throws a LexScannerException when the user interrupted the tool: that ends the run.
CommandResult EndCommand(const Command& command, platform::Processes::Ended ended);

// What a tool writes, from ahead of its start until it is known to be whole: on any other way out, and in the next run
// if this one is killed, it is deleted, so that no half of it passes for good.
class ToolOutputs {
 public:
  // `passing`: files that only the tool's run needs. Raises FileException when no note of them can be made.
  ToolOutputs(const ConfigSettings& settings, std::vector<std::string> outputs, std::vector<std::string> passing);
  ~ToolOutputs();
  ToolOutputs(const ToolOutputs&) = delete;
  ToolOutputs& operator=(const ToolOutputs&) = delete;

  void Keep() { m_areWhole = true; }

 private:
  const ConfigSettings& m_settings;
  const std::vector<std::string> m_outputs;
  std::vector<std::string> m_noted;  // the passing ones as well
  bool m_areWhole = false;
};

// A file that only the next command reads. Raises FileException when it cannot be written.
class CommandFile {
 public:
  CommandFile(LeftoverSweep& leftovers, std::string path, std::string_view text);
  ~CommandFile();
  CommandFile(const CommandFile&) = delete;
  CommandFile& operator=(const CommandFile&) = delete;

  const std::string& Path() const { return m_path; }

 private:
  std::string m_path;
};

}  // namespace qrex
