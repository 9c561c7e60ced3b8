// What tools print: messages are counted, and those about generated files are followed back to their source.
#include "builder/tool_output.h"
#include "fuzz/fuzz_world.h"

using namespace qrex;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size == 0) return 0;
  const std::string output(reinterpret_cast<const char*>(data) + 1, size - 1);
  static fuzz::World world(CompilerKind::gcc, "{ \"t.h\" \"src\" { \"app.cpp\" } }\n");
  world.settings.compiler = data[0] % 2 ? CompilerKind::gcc : CompilerKind::vc14;
  static const bool isChecked = world.workspace->CheckFileReferences();
  if (!world.builder) world.StartBuild();
  fuzz::Run([&] {
    if (isChecked && !world.builder->FindFile("app/t.h")) __builtin_trap();
    ScannedFile& header = world.Scanned("app/t.h");
    header.state = TranslationState::Done;
    header.text.source = "a\nb\n";
    header.text.lines = {nullptr, header.text.source.data()};
    ScanToolOutput(*world.builder, output);
  });
  return 0;
}
