// The translator over a header, then over the source that registers what the header declares.
#include "fuzz/fuzz_world.h"
#include "translator/file/translate_file.h"

using namespace qrex;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string text(reinterpret_cast<const char*>(data), size);
  if (text.find("python") != std::string::npos) return 0;
  fuzz::Run([&] {
    fuzz::World world(CompilerKind::gcc, "{ \"t.h\" \"src\" { \"app.cpp\" } }\n");
    fuzz::World::Write("tree/app/t.h", "@import \"Vesk/vxObject/IObject.h\"\n" + text);
    fuzz::World::Write("tree/app/src/app.cpp", "@import \"app/t.h\"\n");
    world.workspace->CheckFileReferences();
    world.App().CollectFiles();
    world.StartBuild();
    BringUpToDate(world.Scanned("app/src/app.cpp"));
  });
  return 0;
}
