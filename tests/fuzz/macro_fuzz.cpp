// Macro expansion of a whole file, its source map included.
#include "fuzz/fuzz_world.h"

using namespace qrex;

namespace {

// Answers every import: an imported file defines nothing.
class NoImports : public ImportHandler {
 public:
  bool Import(LSFrame&, const std::string&, const char*) override { return true; }
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string text(reinterpret_cast<const char*>(data), size);
  if (text.find("python") != std::string::npos) return 0;  // runs what it likes
  fuzz::Run([&] {
    MacroWorld world;
    world.limits = fuzz::kLimits;
    LSFileFrame frame(world);
    NoImports handler;
    SourceMap map;
    const std::string output = ExpandToStringWithMap(&handler, frame, TextRange(std::string_view(text)), 0, 0, map);
    MapCursor cursor(map);
    for (size_t i = 0; i < output.size(); ++i) {
      const char* position = cursor.Map(static_cast<int64_t>(i));
      if (position && (position < text.data() || position > text.data() + text.size())) __builtin_trap();
    }
  });
  return 0;
}
