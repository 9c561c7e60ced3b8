// A test with a world in a folder of its own, which keeps what the tool writes to the trace log.
#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <utility>

#include "platform/system.h"
#include "text/files.h"
#include "text/trace.h"
#include "world.h"

namespace qrex {

class WorldTest : public ::testing::Test, protected World, public TraceHook {
 protected:
  WorldTest() { SetTraceHook(this); }
  ~WorldTest() override {
    SetTraceHook(nullptr);
    platform::SetEnvironment("PATH", m_path);
  }
  void OnTrace(std::string_view text) override { trace += text; }
  std::string TakeTrace() { return std::exchange(trace, {}); }

  // A program that is a script of the shell; tests are free to change PATH. Where a program has to be one for Windows,
  // it is that of tests/windows/stand_in.cpp, which knows what the scripts of these tests do.
  static void WriteProgram(const std::string& path, const std::string& script) {
#ifdef QREX_STAND_IN
    const std::string program = path + (path.ends_with(".exe") ? "" : ".exe");
    CreateDirectories(program, false);
    std::filesystem::remove(program);
    std::filesystem::copy_file(QREX_STAND_IN, program);
    Write(program + ".script", script);
#else
    Write(path, "#!/bin/sh\n" + script);
    std::filesystem::permissions(path, std::filesystem::perms::owner_all);
#endif
  }
  void PutToolsOnPath() const {
    platform::SetEnvironment("PATH", std::string("tools") + platform::kPathListSeparator + m_path);
  }

  // Writes the project and loads it, with what it depends on, into the workspace.
  Project& AddProject(const std::string& directory, std::string_view targetType, const std::string& statements) {
    WriteProject(directory, targetType, statements);
    EXPECT_TRUE(workspace->LoadProject(ProjectPathOf(directory))) << trace;
    return *workspace->FindSubproject(ProjectPathOf(directory));
  }

  std::string trace;

 private:
  const std::string m_path = platform::EnvironmentValue("PATH").value_or("");
  const OwnFolder m_folder{::testing::TempDir()};
};

}  // namespace qrex
