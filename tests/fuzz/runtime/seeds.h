// How targets of the runtime begin.
#pragma once

#include <cstdint>
#include <cstdlib>
#include <fstream>
#include <string>
#include <vector>

void Register_Project_kinds();

inline void Require(bool holds) {
  if (!holds) std::abort();
}

// Registers the kinds. With `--seeds FOLDER` it writes the seeds, each behind its number, and ends.
template <typename Seed>
int Begin(int count, char** arguments, std::vector<Seed> (*seeds)()) {
  Register_Project_kinds();
  if (count < 3 || std::string(arguments[1]) != "--seeds") return 0;
  int number = 0;
  for (Seed const& seed : seeds()) {
    std::ofstream file(arguments[2] + ("/seed" + std::to_string(number)), std::ios::binary);
    file.put(static_cast<char>(number++));
    file.write(reinterpret_cast<char const*>(seed.data()), static_cast<std::streamsize>(seed.size()));
  }
  std::exit(0);
}
