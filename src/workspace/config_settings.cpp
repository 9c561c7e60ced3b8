#include "workspace/config_settings.h"

#include "platform/console.h"
#include "platform/system.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/version.h"

namespace qrex {

const PlatformEnvironment* ConfigSettings::Environment() const {
  auto found = platformEnvironments.find(platform);
  return found == platformEnvironments.end() ? nullptr : &found->second;
}

std::string TranslationKeys(const ConfigSettings& settings) {
  std::string text = "release=" + std::string(Version()) + "\n";
  const auto add = [&](std::string_view name, std::string_view value) {
    text.append(name).append("=").append(value).append("\n");
  };
  add("compiler", CompilerOf(settings.compiler).keyword);
  add("config", settings.config);
  add("platform", settings.platform);
  add("systemName", settings.systemName);
  add("systemProcessor", settings.systemProcessor);
  add("systemVersion", settings.systemVersion);
  add("sizeofPointer", settings.sizeofPointer);
  add("defaultToDll", settings.defaultToDll ? "true" : "false");
  add("modernCpp", settings.modernCpp ? "true" : "false");
  add("compilableText", settings.compilableText ? "true" : "false");
  if (settings.lineDirectives) add("lineDirectives", "true");
  if (settings.positionMaps) add("positionMaps", "true");
  if (settings.annotations) add("annotations", "true");
  for (const std::string& root : settings.virtualTree) add("virtualTree", root);
  for (const auto& [name, value] : settings.context.rootFrame.Substitutions()) {
    const bool isOfOneRun = name == "COMPILE_FILE_PATH" || name == "TARGET_DIR";
    if (!isOfOneRun) add("$" + name, value);
  }
  return text;
}

void ApplyEnvironment(const PlatformEnvironment& environment) {
  std::string path;
  ReplaceChar(environment.PATH, path, ';', platform::kPathListSeparator);
  platform::SetEnvironment("PATH", path);
  platform::SetEnvironment("INCLUDE", environment.INCLUDE);
  platform::SetEnvironment("LIB", environment.LIB);
}

namespace {

std::string Tried(const std::vector<std::string>& paths, const ConfigSettings& settings) {
  std::string text = "not found as ";
  for (const std::string& path : paths) text += (&path == &paths.front() ? "" : ", ") + path;
  if (settings.virtualTree.empty()) text += "; virtualTree has no roots";
  return text + " (relative paths begin in the folder where Qrex runs)";
}

std::vector<std::string> ImportCandidates(const ConfigSettings& settings, const std::string& path) {
  std::vector<std::string> candidates{path};
  for (const auto* directories : {&settings.context.importPaths, &settings.virtualTree}) {
    for (const std::string& directory : *directories) candidates.push_back(PathJoin(directory, path));
  }
  return candidates;
}

}  // namespace

bool FindImport(const ConfigSettings& settings, const std::string& path, std::string& found) {
  if (!platform::IsValidUtf8(path)) return false;
  for (std::string& candidate : ImportCandidates(settings, path)) {
    if (!settings.macroWorld.sources->Has(candidate)) continue;
    found = std::move(candidate);
    return true;
  }
  return false;
}

std::string TriedImports(const ConfigSettings& settings, const std::string& path) {
  return Tried(ImportCandidates(settings, path), settings);
}

std::string TriedInTree(const ConfigSettings& settings, const std::string& path) {
  std::vector<std::string> candidates;
  for (const std::string& root : settings.virtualTree) candidates.push_back(PathJoin(root, path));
  return Tried(candidates, settings);
}

bool FindInTree(const ConfigSettings& settings, const std::string& path, std::string& root, std::string& fullPath) {
  for (const std::string& candidate : settings.virtualTree) {
    fullPath = PathJoin(candidate, path);
    if (!settings.macroWorld.sources->Has(fullPath)) continue;
    root = candidate;
    return true;
  }
  return false;
}

}  // namespace qrex
