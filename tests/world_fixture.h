// A test with a world in a folder of its own, which keeps what the tool writes to the trace log.
#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <utility>

#include "text/trace.h"
#include "world.h"

namespace qrex {

class WorldTest : public ::testing::Test, protected World, public TraceHook {
 protected:
  WorldTest() { SetTraceHook(this); }
  ~WorldTest() override {
    SetTraceHook(nullptr);
    setenv("PATH", m_path.c_str(), 1);
  }
  void OnTrace(std::string_view text) override { trace += text; }
  std::string TakeTrace() { return std::exchange(trace, {}); }

  // A program that is a script of the shell; tests are free to change PATH.
  static void WriteProgram(const std::string& path, const std::string& script) {
    Write(path, "#!/bin/sh\n" + script);
    std::filesystem::permissions(path, std::filesystem::perms::owner_all);
  }

  // Writes the project and loads it, with what it depends on, into the workspace.
  Project& AddProject(const std::string& directory, std::string_view targetType, const std::string& statements) {
    WriteProject(directory, targetType, statements);
    EXPECT_TRUE(workspace->LoadProject(ProjectPathOf(directory))) << trace;
    return *workspace->FindSubproject(ProjectPathOf(directory));
  }

  std::string trace;

 private:
  const std::string m_path = std::getenv("PATH");
  const OwnFolder m_folder{::testing::TempDir()};
};

}  // namespace qrex
