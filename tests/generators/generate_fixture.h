// Generates project files, as a run in mode `gen` does after the load.
#pragma once

#include "generators/common.h"
#include "generators/generate.h"
#include "world_fixture.h"

namespace qrex {

class GenerateTest : public WorldTest {
 protected:
  GenerateTest() {
    configs += " \"Release|x64\"";
    settings.exportLib = "out/lib";
    settings.context.rootFrame.DefineSubstitution("EXPORT_LIB", settings.exportLib);
    settings.defaultToDll = false;
    settings.config = settings.platform = "";  // all are written
  }

  // Loads a project with what it depends on, and writes all forms. The n-th project in build order gets an identifier
  // of bytes 0xNN.
  void Generate(const std::string& entry) {
    Load({entry});
    EXPECT_TRUE(workspace->CheckFileReferences()) << trace;
    workspace->SortProjects();
    uint8_t digit = 0;
    for (const auto& loaded : workspace->projects) loaded->guid.bytes.fill(static_cast<uint8_t>(0x11 * ++digit));
    trace.clear();
    Generator generator(settings.leftovers);
    for (const auto& project : workspace->projects) {
      generator.WriteProject(*project, Form::Plain);
      if (project->usesQrex) generator.WriteProject(*project, Form::Translated);
    }
    generator.WriteWorkspace(*workspace, Form::Plain);
    if (AnyProjectUsesQrex(*workspace)) generator.WriteWorkspace(*workspace, Form::Translated);
  }
};

}  // namespace qrex
