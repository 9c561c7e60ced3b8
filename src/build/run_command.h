// Starting a tool through the command interpreter.
#pragma once

#include <string>

namespace qrex {

struct CommandOptions {
  bool echo = false;
  std::string* output = nullptr;  // where the captured standard output goes; null: not captured
  std::string* errors = nullptr;
  bool errorsIntoOutput = false;   // the error stream joins the captured output
  bool failOnNonZero = false;
  bool failOnErrorText = false;
};

// False when the command could not be run or failed as the options say. `returnCode` is the interpreter's.
bool RunCommand(const std::string& command, int& returnCode, const CommandOptions& options);

}  // namespace qrex
