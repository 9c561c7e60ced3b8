#include "builder/run_command.h"

#include "lex/token.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/output_policy.h"
#include "text/text_writer.h"

namespace qrex {

namespace {

constexpr char kOutputFile[] = "out1.txt";
constexpr char kErrorFile[] = "out2.txt";

// What the interpreter answers when no tool did.
constexpr int kNotExecutable = 126;
constexpr int kNotFound = 127;
constexpr int kEndedBySignal = 128;  // plus the signal
constexpr int kLastSignal = 64;
constexpr int kInterrupt = 2, kQuit = 3;

void ReportNoInterpreter(platform::NoInterpreter cause) {
  using platform::NoInterpreter;
  TraceWriter trace;
  trace << "ERROR running command interpreter\n";
  switch (cause) {
    case NoInterpreter::NotFound:
      trace << "Command interpreter cannot be found\n";
      break;
    case NoInterpreter::LineTooLong:
      trace << "Argument List is too big\n";
      break;
    case NoInterpreter::NotAProgram:
      trace << "Command-interpreter file has invalid format and is not executable\n";
      break;
    case NoInterpreter::NoMemory:
      trace << "Not enough memory is available to execute command;\n"
               "or available memory has been corrupted; or invalid block exists,\n"
               "indicating that process making call was not allocated properly.\n";
      break;
    case NoInterpreter::OtherCause:
      break;
  }
}

std::string_view ToolOf(std::string_view command) {
  constexpr std::string_view kInterpreter = "cmd /c ";
  if (command.substr(0, kInterpreter.size()) == kInterpreter) command.remove_prefix(kInterpreter.size());
  return command.substr(0, command.find(' '));
}

void ReportAbnormalEnd(std::string_view command, int returnCode) {
  TraceWriter trace;
  trace << "ERROR: " << ToolOf(command);
  if (returnCode == kNotFound) {
    trace << " was not found on PATH\n";
  } else if (returnCode == kNotExecutable) {
    trace << " cannot be executed\n";
  } else {
    trace << " was ended by signal " << returnCode - kEndedBySignal << "\n";
  }
}

// Reads a capture file and deletes it.
bool TakeCapture(const char* path, std::string& text) {
  if (!LoadText(text, path, true)) return false;
  DeleteFile(path);
  return true;
}

}  // namespace

bool IsAbnormalEnd(int returnCode) {
  return returnCode == kNotExecutable || returnCode == kNotFound ||
         (returnCode > kEndedBySignal && returnCode <= kEndedBySignal + kLastSignal);
}

bool RunCommand(platform::ToolKeeper& tools, const std::string& command, int& returnCode,
                const CommandOptions& options) {
  std::string line = command;
  if (options.output) {
    line += std::string(" 1>") + kOutputFile;
    DeleteThoughReadOnly(kOutputFile);  // what an earlier run may have left is not this tool's
  }
  if (options.errorsIntoOutput) line += " 2>&1";
  if (options.errors) {
    line += std::string(" 2>") + kErrorFile;
    DeleteThoughReadOnly(kErrorFile);
  }
  if (options.echo) TraceWriter() << line << "\n";
  auto fail = [&](std::string_view message) {
    if (!options.echo) TraceWriter() << line << "\n";
    TraceWriter() << message;
    return false;
  };

  returnCode = platform::RunCommand(tools, line);
  if (returnCode == -1) {
    const platform::NoInterpreter cause = platform::WhyNoInterpreter();
    fail("");
    ReportNoInterpreter(cause);
    return false;
  }
  if (returnCode == kEndedBySignal + kInterrupt || returnCode == kEndedBySignal + kQuit) {
    if (options.output) DeleteFile(kOutputFile);
    if (options.errors) DeleteFile(kErrorFile);
    throw LexScannerException("Interrupted while running " + std::string(ToolOf(command)), nullptr);
  }
  if (IsAbnormalEnd(returnCode)) ReportAbnormalEnd(command, returnCode);
  if (returnCode != 0 && options.failOnNonZero) return fail("Return code : " + std::to_string(returnCode) + "\n");
  if (options.output && !TakeCapture(kOutputFile, *options.output)) return fail("ERROR getting stdout\n");
  if (options.errors && !TakeCapture(kErrorFile, *options.errors)) return fail("ERROR getting stderr\n");
  if (options.errors && !options.errors->empty()) {
    if (options.failOnErrorText) return fail(*options.errors + "\n");
    TraceWriter() << *options.errors << "\n";
  }
  return true;
}

ToolOutputs::ToolOutputs(const ConfigSettings& settings, std::vector<std::string> outputs,
                         std::vector<std::string> passing)
    : m_settings(settings), m_outputs(std::move(outputs)), m_noted(std::move(passing)) {
  m_noted.insert(m_noted.end(), {kOutputFile, kErrorFile});
  m_noted.insert(m_noted.end(), m_outputs.begin(), m_outputs.end());
  m_settings.outputNotes.Add(m_settings.leftovers, m_noted);
}

ToolOutputs::~ToolOutputs() {
  bool areLeft = false;
  if (!m_areWhole) {
    for (const std::string& output : m_outputs) {
      DeleteThoughReadOnly(output);
      areLeft = areLeft || LastWriteTime(output) != 0;
    }
  }
  if (!areLeft) m_settings.outputNotes.Remove(m_noted);
}

CommandFile::CommandFile(LeftoverSweep& leftovers, std::string path, std::string_view text) : m_path(std::move(path)) {
  leftovers.Beside(m_path);
  ReplaceFile(m_path, WithCarriageReturns(text), ReadOnlyTarget::Replace);
}

CommandFile::~CommandFile() { DeleteThoughReadOnly(m_path); }

}  // namespace qrex
