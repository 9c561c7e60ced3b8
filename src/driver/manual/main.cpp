// Writes the manual page and the completions of shells, which a build makes to be installed: qrex_manual FOLDER

#include "driver/manual.h"
#include "text/exceptions.h"
#include "text/files.h"
#include "text/trace.h"

int main(int argc, char** argv) {
  if (argc != 2) {
    qrex::WriteToConsole("qrex_manual FOLDER\n");
    return 1;
  }
  const std::string folder = std::string(argv[1]) + "/";
  try {
    qrex::ReplaceFile(folder + "Qrex.1", qrex::ManualPage());
    qrex::ReplaceFile(folder + "Qrex.bash", qrex::BashCompletion());
    qrex::ReplaceFile(folder + "_Qrex", qrex::ZshCompletion());
  } catch (const qrex::IException& exception) {
    qrex::WriteToConsole(qrex::ExceptionText(exception) + "\n");
    return 1;
  }
  return 0;
}
