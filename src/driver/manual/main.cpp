// Writes the manual page and the completions of shells, which a build makes to be installed: qrex_manual FOLDER

#include <fstream>
#include <iostream>

#include "driver/manual.h"

int main(int argc, char** argv) {
  if (argc != 2) {
    std::cerr << "qrex_manual FOLDER\n";
    return 1;
  }
  const std::string folder = std::string(argv[1]) + "/";
  const std::pair<const char*, std::string> files[] = {
      {"Qrex.1", qrex::ManualPage()}, {"Qrex.bash", qrex::BashCompletion()}, {"_Qrex", qrex::ZshCompletion()}};
  for (const auto& [name, text] : files) {
    std::ofstream file(folder + name);
    file << text;
    if (!file.flush()) {
      std::cerr << "Can't write " << folder << name << "\n";
      return 1;
    }
  }
  return 0;
}
