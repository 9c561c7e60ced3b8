// Switch blocks and linker text, from the project file to command lines and properties. The first byte says which
// block.
#include "fuzz/fuzz_world.h"
#include "workspace/linker_text.h"
#include "workspace/switch_blocks.h"

using namespace qrex;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size == 0) return 0;
  const std::string text(reinterpret_cast<const char*>(data) + 1, size - 1);
  if (text.find('@') != std::string::npos) return 0;  // other targets look at macros
  constexpr std::string_view kBlocks[] = {"+cpp", "-cpp", "+link", "-link", "+rc", "-rc"};
  const std::string_view block = kBlocks[data[0] % std::size(kBlocks)];
  const CompilerKind compiler = data[0] & 0x40   ? CompilerKind::gcc
                                : data[0] & 0x80 ? CompilerKind::vc6
                                                 : CompilerKind::vc14;
  fuzz::Run([&] {
    fuzz::World world(compiler, "+cpp { /W3 /D \"A\" }\n" + std::string(block) + " {" + text +
                                    "}\n{ \"src\" { \"a.cpp\" : " + std::string(block) + " {" + text + "} } }\n");
    if (!world.isLoaded) return;
    Project& app = world.App();
    app.CollectFiles();
    ProjectConfig& config = *app.configs.front();
    MemoryTextWriter out;
    for (const ProjectFile* file : app.files) WriteCompilerSwitches(out, *file, config);
    WriteResourceSwitches(out, config);
    OptionMap options;
    ParseLinkerText(app, config, options);
    ParseLibrarianText(app, config, options);
    std::set<std::string> libraries;
    GatherLibraries(app, config, {}, libraries);
  });
  return 0;
}
