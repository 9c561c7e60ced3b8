// Configuration, workspace and project files. The first byte says which.
#include "driver/config_parser.h"
#include "fuzz/fuzz_world.h"
#include "workspace/workspace_parser.h"

using namespace qrex;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size == 0) return 0;
  const std::string text(reinterpret_cast<const char*>(data) + 1, size - 1);
  if (text.find("python") != std::string::npos) return 0;
  fuzz::EnterScratchFolder();
  fuzz::Run([&] {
    switch (data[0] % 3) {
      case 0: {
        ConfigSettings settings;
        settings.macroWorld.limits = fuzz::kLimits;
        fuzz::World::Write("empty.qrex", "");
        if (LoadConfiguration(settings, "empty.qrex", text)) ValidateSettings(settings);
        break;
      }
      case 1: {
        fuzz::World world(CompilerKind::vc14, "{ }");
        fuzz::World::Write("tree/all.qrws", text);
        WorkspaceParser parser(*world.workspace, "tree/all.qrws");
        MpfwSourceFile* file = parser.LoadSourceFile("tree/all.qrws");
        if (!file) break;
        parser.SetInput(TextRange(std::string_view(file->expansion)));
        parser.ParseWorkspace();
        world.workspace->SortProjects();
        break;
      }
      default: {
        fuzz::World world(data[0] % 2 ? CompilerKind::gcc : CompilerKind::vc14, text);
        if (world.isLoaded && world.workspace->CheckFileReferences()) world.App().CollectFiles();
        break;
      }
    }
  });
  return 0;
}
