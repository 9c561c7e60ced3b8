// A tree in a folder of the test's own, and what the tool writes to the trace log about it.
#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <string>

#include "text/files.h"
#include "text/trace.h"
#include "workspace/workspace.h"

namespace qrex {

class WorkspaceTest : public ::testing::Test, public TraceHook {
 protected:
  WorkspaceTest() : m_start(std::filesystem::current_path()) {
    const auto* test = ::testing::UnitTest::GetInstance()->current_test_info();
    m_folder = std::filesystem::path(::testing::TempDir()) / (std::string(test->test_suite_name()) + test->name());
    std::filesystem::remove_all(m_folder);
    std::filesystem::create_directories(m_folder);
    std::filesystem::current_path(m_folder);
    SetTraceHook(this);
    settings.virtualTree = {"tree", "more"};
    settings.exportLib = "lib";
    settings.exportTranslatedInclude = "tinc";
    settings.exportUntranslatedInclude = "uinc";
    settings.config = "Debug";
    settings.platform = "x64";
    settings.compiler = CompilerKind::gcc;
    settings.translateOnly = true;
    Restart();
  }
  ~WorkspaceTest() override {
    SetTraceHook(nullptr);
    workspace.reset();
    std::filesystem::current_path(m_start);
    std::filesystem::remove_all(m_folder);
  }

  void OnTrace(std::string_view text) override { trace.append(text); }
  std::string TakeTrace() { return std::exchange(trace, {}); }

  void Restart() { workspace = std::make_unique<Workspace>(settings); }

  static void Write(const std::string& path, std::string_view text) {
    CreateDirectories(path, false);
    std::filesystem::remove(path);
    ReplaceFile(path, text);
  }
  static std::string Read(const std::string& path) {
    std::string bytes;
    return ReadWholeFile(bytes, path) ? bytes : "no file " + path;
  }
  // tree/NAME/src/NAME.qrpj, of a console application with one configuration.
  static void WriteProject(const std::string& name, const std::string& rest) {
    Write("tree/" + name + "/src/" + name + ".qrpj", "$TARGET_TYPE = \"Console Application\"\n$ROOT_TO_PROJDIR = \"" +
                                                         name + "\"\nconfig { \"Debug|x64\" }\n" + rest);
  }
  // The names of the projects in their order.
  std::string ProjectNames() const {
    std::string names;
    for (const auto& project : workspace->projects) names += (names.empty() ? "" : " ") + project->name;
    return names;
  }

  ConfigSettings settings;
  std::unique_ptr<Workspace> workspace;
  std::string trace;

 private:
  std::filesystem::path m_start, m_folder;
};

}  // namespace qrex
