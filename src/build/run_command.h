// Starting a tool through the command interpreter.
#pragma once

#include <string>
#include <string_view>

#include "text/files.h"

namespace qrex {

struct CommandOptions {
  bool echo = false;
  std::string* output = nullptr;  // where the captured standard output goes; null: not captured
  std::string* errors = nullptr;
  bool errorsIntoOutput = false;  // the error stream joins the captured output
  bool failOnNonZero = false;
  bool failOnErrorText = false;
};

// False when the command could not be run or failed as the options say; the trace log has told why. `returnCode` is the
// interpreter's. Throws a LexScannerException when the user interrupted the tool: that ends the run.
bool RunCommand(const std::string& command, int& returnCode, const CommandOptions& options);

// True of a code that no tool chose: the interpreter could not start it, or a signal ended it.
bool IsAbnormalEnd(int returnCode);

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
