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

void ReportNoInterpreter(platform::ProcessEnd::StartFailure failure) {
  using Failure = platform::ProcessEnd::StartFailure;
  TraceWriter trace;
  trace << "ERROR running command interpreter\n";
  switch (failure) {
    case Failure::NotFound:
      trace << "Command interpreter cannot be found\n";
      break;
    case Failure::TooLong:
      trace << "Argument List is too big\n";
      break;
    case Failure::BadFormat:
      trace << "Command-interpreter file has invalid format and is not executable\n";
      break;
    case Failure::NoMemory:
      trace << "Not enough memory is available to execute command;\n"
               "or available memory has been corrupted; or invalid block exists,\n"
               "indicating that process making call was not allocated properly.\n";
      break;
    case Failure::None:
    case Failure::Other:
      break;
  }
}

std::string_view ToolOf(std::string_view command) {
  constexpr std::string_view kInterpreter = "cmd /c ";
  if (command.substr(0, kInterpreter.size()) == kInterpreter) command.remove_prefix(kInterpreter.size());
  if (command.starts_with('"')) return command.substr(1, command.find('"', 1) - 1);
  return command.substr(0, command.find(' '));
}

void ReportAbnormalEnd(std::string_view command, const platform::ProcessEnd& end) {
  using Cause = platform::ProcessEnd::Cause;
  TraceWriter trace;
  trace << "ERROR: " << ToolOf(command);
  if (end.cause == Cause::NotFound) {
    trace << " was not found on PATH\n";
  } else if (end.cause == Cause::NotExecutable) {
    trace << " cannot be executed\n";
  } else {
    trace << " was ended by " << end.EndedBy() << "\n";
  }
}

// As the interpreter would be told to capture: what is printed comes through pipes, and the files are left out.
std::string LineOf(const Command& command) {
  std::string line = command.line;
  if (command.capturesOutput) line += std::string(" 1>") + kOutputFile;
  if (command.errorsIntoOutput) line += " 2>&1";
  if (command.capturesErrors) line += std::string(" 2>") + kErrorFile;
  return line;
}

bool TakeCaptured(platform::CapturedText& captured, std::string& text) {
  std::optional<std::string> whole = captured.Take();
  if (!whole) return false;
  FoldLineEnds(*whole);
  text = std::move(*whole);
  return true;
}

}  // namespace

platform::Processes::Id StartCommand(platform::Processes& tools, const Command& command) {
  using Stream = platform::Program::Stream;
  // What bears these names is left of a run that needed them.
  if (command.capturesOutput) DeleteThoughReadOnly(kOutputFile);
  if (command.capturesErrors) DeleteThoughReadOnly(kErrorFile);
  if (command.echo) TraceWriter() << LineOf(command) << "\n";
  const bool isShownBehind = command.showsOutputBehind;
  return tools.Start({.words = command.words,
                      .line = command.line,
                      .output = command.capturesOutput || isShownBehind ? Stream::Captured : Stream::Inherited,
                      .errors = command.capturesErrors ? Stream::Captured : Stream::Inherited,
                      .errorsIntoOutput = command.errorsIntoOutput || isShownBehind});
}

CommandResult EndCommand(const Command& command, platform::Processes::Ended ended) {
  CommandResult result;
  result.end = ended.end;
  auto fail = [&](std::string_view message) {
    if (!command.echo) TraceWriter() << LineOf(command) << "\n";
    TraceWriter() << message;
    return result;
  };

  if (std::string shown; command.showsOutputBehind && TakeCaptured(ended.output, shown)) TraceWriter() << shown;
  if (ended.end.cause == platform::ProcessEnd::Cause::NotStarted) {
    fail("");
    ReportNoInterpreter(ended.end.failure);
    return result;
  }
  if (ended.end.IsInterrupt()) {
    throw LexScannerException("Interrupted while running " + std::string(ToolOf(command.line)), nullptr);
  }
  if (!ended.end.IsNormal()) ReportAbnormalEnd(command.line, ended.end);
  if (result.ReturnCode() != 0 && command.failOnNonZero) {
    return fail("Return code : " + std::to_string(result.ReturnCode()) + "\n");
  }
  if (command.capturesOutput && !TakeCaptured(ended.output, result.output)) return fail("ERROR getting stdout\n");
  if (command.capturesErrors && !TakeCaptured(ended.errors, result.errors)) return fail("ERROR getting stderr\n");
  if (!result.errors.empty()) {
    if (command.failOnErrorText) return fail(result.errors + "\n");
    TraceWriter() << result.errors << "\n";
  }
  result.succeeded = true;
  return result;
}

ToolOutputs::ToolOutputs(const ConfigSettings& settings, std::vector<std::string> outputs,
                         std::vector<std::string> passing)
    : m_settings(settings), m_outputs(std::move(outputs)), m_noted(std::move(passing)) {
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
  ReplaceOwnFile(m_path, WithCarriageReturns(text));
}

CommandFile::~CommandFile() { DeleteThoughReadOnly(m_path); }

}  // namespace qrex
