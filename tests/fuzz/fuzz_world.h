// What the fuzz targets share. A target is one function over an input; every failure it may meet is an exception of the
// tool's own family, everything else is a finding. Files that a target needs stand in a folder of the process's own.
#pragma once

#include <unistd.h>

#include <cstdint>
#include <filesystem>
#include <memory>
#include <string>
#include <string_view>

#include "build/project_builder.h"
#include "driver/config_parser.h"
#include "macro/expand.h"
#include "text/files.h"
#include "text/trace.h"
#include "workspace/workspace.h"

namespace qrex::fuzz {

// The current directory of the process from here on.
inline void EnterScratchFolder() {
  static const struct Folder {
    Folder() : path(std::filesystem::temp_directory_path() / ("qrex_fuzz_" + std::to_string(getpid()))) {
      std::filesystem::create_directories(path / "tree/app/src");
      std::filesystem::create_directories(path / "tree/Vesk/vxObject/src");
      std::filesystem::current_path(path);
      SetTraceHook(nullptr);
      ReplaceFile("main.qrex",
                  "virtualTree = { \"tree\" } $EXPORT_LIB = \"lib\" $EXPORT_TRANSLATED_INCLUDE = \"t\" "
                  "$EXPORT_UNTRANSLATED_INCLUDE = \"u\" workspaces = { \"app\" } config = \"Debug\" platform = \"x64\" "
                  "translateOnly = true\n");
      ReplaceFile("empty.qrex", "");
      ReplaceFile("tree/Vesk/vxObject/IObject.h",
                  "namespace vesk { $interface+ IObject { }; $interface+ IPersistable : IObject { }; }\n");
      ReplaceFile(
          "tree/Vesk/vxObject/src/vxObject.qrpj",
          "$TARGET_TYPE = \"Static Library\" $ROOT_TO_PROJDIR = \"Vesk/vxObject\" qrex config { \"Debug|x64\" } "
          "{ \"IObject.h\" }\n");
    }
    ~Folder() {
      std::error_code ignored;
      std::filesystem::current_path("/", ignored);
      std::filesystem::remove_all(path, ignored);
    }
    std::filesystem::path path;
  } folder;
}

constexpr ExpansionLimits kLimits = {10'000, 1 << 20};

constexpr std::string_view kAppHeads =
    "$TARGET_TYPE = \"Library\" $ROOT_TO_PROJDIR = \"app\" qrex config { \"Debug|x64\" }\n";

// A loaded workspace: the project `app` with the given text behind its heads, and the runtime's header.
struct World {
  World(CompilerKind compiler, std::string_view appText) {
    EnterScratchFolder();
    ReplaceFile("tree/app/src/app.qrpj", std::string(kAppHeads) + std::string(appText));
    LoadConfiguration(settings, "main.qrex", "");
    settings.compiler = compiler;
    settings.macroWorld.limits = kLimits;
    workspace = std::make_unique<Workspace>(settings);
    isLoaded = workspace->LoadProject("app/src/app.qrpj") && workspace->LoadProject("Vesk/vxObject/src/vxObject.qrpj");
  }
  Project& App() { return *workspace->projects.front(); }

  ConfigSettings settings;
  std::unique_ptr<Workspace> workspace;
  bool isLoaded = false;
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
