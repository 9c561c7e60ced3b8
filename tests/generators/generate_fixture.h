// Generates project files in a folder of the test's own, as a run in mode `gen` does after the load.
#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <string>

#include "generators/common.h"
#include "generators/generate.h"
#include "text/files.h"
#include "text/trace.h"
#include "workspace/workspace.h"

namespace qrex {

class GenerateTest : public ::testing::Test, public TraceHook {
 protected:
  GenerateTest() : m_start(std::filesystem::current_path()) {
    const std::filesystem::path folder =
        std::filesystem::path(::testing::TempDir()) / ::testing::UnitTest::GetInstance()->current_test_info()->name();
    std::filesystem::remove_all(folder);
    std::filesystem::create_directories(folder);
    std::filesystem::current_path(folder);
    SetTraceHook(this);
    settings.virtualTree = {"tree"};
    settings.exportLib = "out/lib";
    settings.context.rootFrame.DefineSubstitution("EXPORT_LIB", settings.exportLib);
    settings.defaultToDll = false;
  }
  ~GenerateTest() override {
    SetTraceHook(nullptr);
    const std::filesystem::path folder = std::filesystem::current_path();
    std::filesystem::current_path(m_start);
    std::filesystem::remove_all(folder);
  }
  void OnTrace(std::string_view text) override { trace += text; }

  // Loads a project and what it depends on. The n-th project in build order gets an identifier of bytes 0xNN.
  void Load(const std::string& project) {
    workspace = std::make_unique<Workspace>(settings);
    workspace->name = "all";
    workspace->LoadProject(project);
    EXPECT_TRUE(workspace->CheckFileReferences()) << trace;
    workspace->SortProjects();
    uint8_t digit = 0;
    for (const auto& loaded : workspace->projects) loaded->guid.bytes.fill(static_cast<uint8_t>(0x11 * ++digit));
  }
  void Generate() {
    Generator generator(settings.leftovers);
    for (const auto& project : workspace->projects) {
      generator.WriteProject(*project, Form::Plain);
      if (project->usesQrex) generator.WriteProject(*project, Form::Translated);
    }
    generator.WriteWorkspace(*workspace, Form::Plain);
    if (AnyProjectUsesQrex(*workspace)) generator.WriteWorkspace(*workspace, Form::Translated);
  }
  // tree/NAME/src/NAME.qrpj with the two heads, the configurations Debug and Release, then `statements`.
  static void AddProject(const std::string& name, const std::string& targetType, const std::string& statements) {
    AddFile("tree/" + name + "/src/" + name + ".qrpj", "$TARGET_TYPE = \"" + targetType + "\"\n$ROOT_TO_PROJDIR = \"" +
                                                           name + "\"\nconfig { \"Debug|x64\" \"Release|x64\" }\n" +
                                                           statements);
  }
  static void AddFile(const std::string& path, const std::string& text) {
    CreateDirectories(path, false);
    ReplaceFile(path, text);
  }
  static std::string TextOf(const std::string& path) {
    std::string text;
    EXPECT_TRUE(ReadWholeFile(text, path)) << path;
    return text;
  }

  ConfigSettings settings;
  std::unique_ptr<Workspace> workspace;
  std::string trace;

 private:
  std::filesystem::path m_start;
};

}  // namespace qrex
