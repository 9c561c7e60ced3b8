#include "driver/config_settings.h"

#include <algorithm>

#include "platform/console.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"

namespace qrex {

namespace {
constexpr std::string_view kCompilers[] = {"vc6",  "vc8",  "vc9", "vc10",    "vc11",
                                           "vc12", "vc14", "gcc", "winegcc", "clang"};
}

std::string_view CompilerKeyword(CompilerKind kind) { return kCompilers[static_cast<size_t>(kind)]; }

std::optional<CompilerKind> FindCompiler(std::string_view keyword) {
  const auto* const found = std::find(std::begin(kCompilers), std::end(kCompilers), keyword);
  if (found == std::end(kCompilers)) return std::nullopt;
  return static_cast<CompilerKind>(found - std::begin(kCompilers));
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
