// What the fuzz targets share. A target is one function over an input; every failure it may meet is an exception of the
// tool's own family, everything else is a finding. Files that a target needs stand in a folder of the process's own.
#pragma once

#include <cstdint>
#include <utility>

#include "macro/expand.h"
#include "world.h"

namespace qrex::fuzz {

// The current directory of the process from here on.
inline void EnterScratchFolder() { static const OwnFolder folder(std::filesystem::temp_directory_path()); }

constexpr ExpansionLimits kLimits = {10'000, 1 << 20};

// A loaded workspace: the project `app` with the given text behind its heads, and the runtime's header.
struct World : qrex::World {
  World(CompilerKind compiler, const std::string& appText) {
    EnterScratchFolder();
    settings.context.rootFrame.DefineSubstitution("EXPORT_LIB", settings.exportLib);
    settings.compiler = compiler;
    settings.macroWorld.limits = kLimits;
    static bool isFirst = true;
    if (std::exchange(isFirst, false)) {
      WriteProject("Vesk/vxObject", "Static Library", "qrex { \"IObject.h\" }\n");
      Write("tree/Vesk/vxObject/IObject.h",
            "namespace vesk { $interface+ IObject { }; $interface+ IPersistable : IObject { }; }\n");
    }
    WriteProject("app", "Library", "qrex " + appText);
    isLoaded = Load({"app", "Vesk/vxObject"});
  }

  bool isLoaded;
};

// `body` may raise what the tool raises.
template <typename Body>
void Run(Body body) {
  try {
    body();
  } catch (const IException&) {
  }
}

}  // namespace qrex::fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size);
