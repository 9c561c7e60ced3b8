#include "workspace/config_settings.h"

#include "platform/console.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"

namespace qrex {

std::string_view CompilerKeyword(CompilerKind kind) {
  static constexpr std::string_view kWords[] = {"vc6",  "vc8",  "vc9", "vc10",    "vc11",
                                                "vc12", "vc14", "gcc", "winegcc", "clang"};
  return kWords[static_cast<size_t>(kind)];
}

const PlatformEnvironment* ConfigSettings::Environment() const {
  auto found = platformEnvironments.find(platform);
  return found == platformEnvironments.end() ? nullptr : &found->second;
}

void ApplyEnvironment(const PlatformEnvironment& environment) {
  std::string path;
  ReplaceChar(environment.PATH, path, ';', platform::kPathListSeparator);
  platform::SetEnvironment("PATH", path);
  platform::SetEnvironment("INCLUDE", environment.INCLUDE);
  platform::SetEnvironment("LIB", environment.LIB);
}

bool FindImport(const ConfigSettings& settings, const std::string& path, std::string& found) {
  found = path;
  if (!platform::IsValidUtf8(path)) return false;
  if (FileExists(found)) return true;
  for (const auto* directories : {&settings.context.importPaths, &settings.virtualTree}) {
    for (const std::string& directory : *directories) {
      found = PathJoin(directory, path);
      if (FileExists(found)) return true;
    }
  }
  return false;
}

bool FindInTree(const ConfigSettings& settings, const std::string& path, std::string& root, std::string& fullPath) {
  for (const std::string& candidate : settings.virtualTree) {
    fullPath = PathJoin(candidate, path);
    if (!FileExists(fullPath)) continue;
    root = candidate;
    return true;
  }
  return false;
}

}  // namespace qrex
