#include "driver/data_folder.h"

#include <algorithm>
#include <vector>

#include "platform/file_system.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/paths.h"
#include "text/version.h"

namespace qrex {

namespace {

// Of an installation, below its prefix: what is the same for every machine, and what is not.
constexpr char kShared[] = "/share/qrex";
constexpr char kBuilt[] = "/lib/qrex/runtime";
constexpr char kReleaseFile[] = "/release";  // of the program that built it
constexpr char kLibrary[] = "/libvxObject.a";

// Beside the program, around it (a build folder in the sources), or where an installation puts them, seen from the
// program or from the root.
std::vector<std::string> Candidates(const std::string& calledAs) {
  if (const auto named = platform::EnvironmentValue("QREX_DATA_FOLDER"); named && !named->empty()) return {*named};
  std::vector<std::string> candidates;
  if (const std::string program = platform::ProgramPath(calledAs); !program.empty()) {
    const std::string folder = program.substr(0, program.rfind('/'));
    for (const char* place : {"/.", "/..", "/../share/qrex"}) candidates.push_back(folder + place);
  }
  candidates.emplace_back(QREX_DATA_FOLDER);
  return candidates;
}

bool IsThere(const std::string& path) {
  platform::FileInfo info;
  return static_cast<bool>(platform::Stat(path, info));
}

// Whether the root has a library for the run. Make files are written for all configurations at once.
bool ServesRun(const std::string& root, const ConfigSettings& settings) {
  if (!CompilerOf(settings.compiler).takesBuiltRuntime) return false;
  if (settings.mode == RunMode::Gen) return IsThere(root);
  return FileExists(root + "/" + settings.platform + "/" + settings.config + kLibrary);
}

}  // namespace

std::optional<std::string> FindDataFolder(const std::string& calledAs, std::span<const char* const> parts,
                                          std::string& tried) {
  for (const std::string& candidate : Candidates(calledAs)) {
    const bool holdsAll =
        std::all_of(parts.begin(), parts.end(), [&](const char* part) { return IsThere(candidate + "/" + part); });
    if (holdsAll) {
      std::string folder;
      Require(RealPathOf(candidate, folder), candidate);
      return folder;
    }
    tried += "\n    " + candidate;
  }
  return std::nullopt;
}

std::string AddRuntimeRoot(ConfigSettings& settings, const std::string& calledAs) {
  if (settings.runtime == RuntimeChoice::None) return {};
  std::string tried;
  const std::optional<std::string> data = FindDataFolder(calledAs, {{kRuntimePart}}, tried);
  if (!data) return "\nERROR:  No runtime in any of" + tried + "\n";
  std::string root = *data + "/" + kRuntimePart;
  if (settings.runtime == RuntimeChoice::Built && data->ends_with(kShared)) {
    const std::string built = data->substr(0, data->size() - (sizeof kShared - 1)) + kBuilt;
    if (ServesRun(built, settings)) {
      std::string release;
      Require(ReadWholeFile(release, built + kReleaseFile), built + kReleaseFile);
      if (release != Version()) {
        return "\nERROR:  The runtime in " + built + " is of release " + release + ", this tool of " +
               std::string(Version()) + "\n";
      }
      root = built;
    }
  }
  settings.virtualTree.push_back(root);
  return {};
}

}  // namespace qrex
