#include "driver/command_line.h"
#include "platform/console.h"
#include "platform/system.h"
#include "text/trace.h"

namespace {

// Holds the deepest nesting that the languages permit; memory is used as it grows.
constexpr size_t kStackSize = size_t{1} << 30;

}  // namespace

int main(int argc, char** argv) {
  int status = 1;
  qrex::platform::FillStandardHandles();
  qrex::platform::SetSignals();
  qrex::platform::TuneHeap();
  qrex::platform::BufferStdout();
  static auto& commandLine =
      *new qrex::CommandLine(qrex::platform::CommandLineWords(argc, argv));  // left to the end of the process
  if (!qrex::platform::RunOnStack(kStackSize, [&] { status = commandLine.Run(); })) {
    qrex::WriteToConsole("Error : Not enough memory to run in\n");
  }
  qrex::platform::FlushStdout();
  return status;
}
