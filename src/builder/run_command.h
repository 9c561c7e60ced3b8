// Starting a tool through the command interpreter.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "text/files.h"
#include "workspace/config_settings.h"

namespace qrex {

struct CommandOptions {
  bool echo = false;
  std::string* output = nullptr;  // where the captured standard output goes; null: not captured
  std::string* errors = nullptr;
  bool errorsIntoOutput = false;  // the error stream joins the captured output
  bool failOnNonZero = false;
  bool failOnErrorText = false;
};

// False when the command could not be run or failed as the options say; the trace log says why. `returnCode` is the
// interpreter's. Throws a LexScannerException when the user interrupted the tool: that ends the run.
bool RunCommand(platform::ToolKeeper& tools, const std::string& command, int& returnCode,
                const CommandOptions& options);

// True of a code that no tool chose: the interpreter could not start it, or a signal ended it.
bool IsAbnormalEnd(int returnCode);

// What a tool writes, from ahead of its start until it is known to be whole: on any other way out, and in the next run
// if this one is killed, it is deleted, so that no half of it passes for good.
class ToolOutputs {
 public:
  // `passing`: files that only the tool's run needs. Raises FileException when no note of them can be made.
  ToolOutputs(const ConfigSettings& settings, std::vector<std::string> outputs, std::vector<std::string> passing);
  ~ToolOutputs();
  ToolOutputs(const ToolOutputs&) = delete;
  ToolOutputs& operator=(const ToolOutputs&) = delete;

  bool Keep() { return m_areWhole = true; }

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
