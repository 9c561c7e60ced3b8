// A test with a world in a folder of its own, which keeps what the tool writes to the trace log.
#pragma once

#include <gtest/gtest.h>

#include <utility>

#include "text/trace.h"
#include "world.h"

namespace qrex {

class WorldTest : public ::testing::Test, protected World, public TraceHook {
 protected:
  WorldTest() { SetTraceHook(this); }
  ~WorldTest() override { SetTraceHook(nullptr); }
  void OnTrace(std::string_view text) override { trace += text; }
  std::string TakeTrace() { return std::exchange(trace, {}); }

  // Writes the project and loads it, with what it depends on, into the workspace.
  Project& AddProject(const std::string& directory, std::string_view targetType, const std::string& statements) {
    WriteProject(directory, targetType, statements);
    EXPECT_TRUE(workspace->LoadProject(ProjectPathOf(directory))) << trace;
    return *workspace->FindSubproject(ProjectPathOf(directory));
  }

  std::string trace;

 private:
  const OwnFolder m_folder{::testing::TempDir()};
};

}  // namespace qrex
