// Tools of a test in the folder `tools`, which comes first on PATH.
#pragma once

#include <filesystem>
#include <string>

#include "platform/system.h"
#include "world.h"

namespace qrex {

// A script for the shell; where a program has to be one for Windows, the one of tests/windows/stand_in.cpp, which knows
// what the scripts of these tests do.
inline void AddTool(const std::string& name, const std::string& script) {
#ifdef QREX_STAND_IN
  const std::string path = "tools/" + name + (name.ends_with(".exe") ? "" : ".exe");
  CreateDirectories(path, false);
  std::filesystem::remove(path);
  std::filesystem::copy_file(QREX_STAND_IN, path);
  World::Write(path + ".script", script);
#else
  World::Write("tools/" + name, "#!/bin/sh\n" + script);
  std::filesystem::permissions("tools/" + name, std::filesystem::perms::owner_all);
#endif
}

// Ahead of the others on PATH, while this object lives.
class ToolsOnPath {
 public:
  ToolsOnPath() : m_path(platform::EnvironmentValue("PATH").value_or("")) {
    platform::SetEnvironment("PATH", std::string("tools") + platform::kPathListSeparator + m_path);
  }
  ~ToolsOnPath() { platform::SetEnvironment("PATH", m_path); }
  ToolsOnPath(const ToolsOnPath&) = delete;

 private:
  const std::string m_path;
};

}  // namespace qrex
