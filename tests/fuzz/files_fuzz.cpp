// The readers of files that earlier runs wrote: the dependency file's payload and projects.guids.
#include "builder/dependency_file.h"
#include "fuzz/fuzz_world.h"

using namespace qrex;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string bytes(reinterpret_cast<const char*>(data), size);
  fuzz::Run([&] {
    static fuzz::World world(CompilerKind::gcc, "{ \"t.h\" \"src\" { \"app.cpp\" } }\n");
    static const bool isChecked = world.workspace->CheckFileReferences();
    world.StartBuild();
    if (isChecked && ParseDependencyPayload(*world.builder, bytes)) DependencyPayload(*world.builder);
    ReplaceFile("projects.guids", bytes);
    world.workspace->SyncProjectGuids();
  });
  return 0;
}
