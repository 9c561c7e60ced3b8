#include <string>

#include "platform/console.h"
#include "platform/system.h"
#include "server/server.h"
#include "text/version.h"

namespace {

constexpr size_t kStackSize = size_t{1} << 30;  // as that of the tool

}  // namespace

int main(int argc, char** argv) {
  const std::string argument = argc > 1 ? argv[1] : "";
  if (argument == "--version") {
    qrex::platform::WriteStdout("qrex-lsp " + std::string(qrex::Version()) + "\n");
    return 0;
  }
  if (argument == "--help") {
    qrex::platform::WriteStdout(
        "qrex-lsp: a language server for Qrex, on standard input and output. Editors start it.\n");
    return 0;
  }
  int status = 1;
  qrex::platform::FillStandardHandles();
  qrex::platform::SetSignals();
  const auto words = qrex::platform::CommandLineWords(argc, argv);
  auto& server = *new qrex::server::Server(words.empty() ? "" : words.front());  // left to the end of the process
  qrex::platform::RunOnStack(kStackSize, [&] { status = server.Run(); });
  qrex::platform::EndAtOnce(status);
}
