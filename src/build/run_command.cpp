#include "build/run_command.h"

#include <cerrno>

#include "platform/system.h"
#include "text/files.h"
#include "text/text_writer.h"

namespace qrex {

namespace {

constexpr char kOutputFile[] = "out1.txt";
constexpr char kErrorFile[] = "out2.txt";

void ReportNoInterpreter() {
  TraceWriter trace;
  trace << "ERROR running command interpreter\n";
  switch (errno) {
    case ENOENT:
      trace << "Command interpreter cannot be found\n";
      break;
    case E2BIG:
      trace << "Argument List is too big\n";
      break;
    case ENOEXEC:
      trace << "Command-interpreter file has invalid format and is not executable\n";
      break;
    case ENOMEM:
      trace << "Not enough memory is available to execute command;\n"
               "or available memory has been corrupted; or invalid block exists,\n"
               "indicating that process making call was not allocated properly.\n";
      break;
    default:
      break;
  }
}

}  // namespace

bool RunCommand(const std::string& command, int& returnCode, const CommandOptions& options) {
  std::string line = command;
  if (options.output) line += std::string(" 1>") + kOutputFile;
  if (options.errorsIntoOutput) line += " 2>&1";
  if (options.errors) line += std::string(" 2>") + kErrorFile;
  if (options.echo) TraceWriter() << line << "\n";
  auto writeCommand = [&] {
    if (!options.echo) TraceWriter() << line << "\n";
  };
  returnCode = platform::RunCommand(line);
  if (returnCode == -1) {
    writeCommand();
    ReportNoInterpreter();
    return false;
  }
  if (returnCode != 0 && options.failOnNonZero) {
    writeCommand();
    TraceWriter() << "Return code : " << returnCode << "\n";
    return false;
  }
  if (options.output && !LoadText(*options.output, kOutputFile, true)) {
    writeCommand();
    TraceWriter() << "ERROR getting stdout\n";
    return false;
  }
  if (options.errors && !LoadText(*options.errors, kErrorFile, true)) {
    writeCommand();
    TraceWriter() << "ERROR getting stderr\n";
    return false;
  }
  if (options.output) DeleteFile(kOutputFile);
  if (options.errors) DeleteFile(kErrorFile);
  if (options.errors && !options.errors->empty()) {
    if (options.failOnErrorText) writeCommand();
    TraceWriter() << *options.errors << "\n";
    return !options.failOnErrorText;
  }
  return true;
}

}  // namespace qrex
