#include "driver/depfile.h"

#include "builder/run_files.h"
#include "platform/file_names.h"
#include "platform/file_system.h"
#include "text/exceptions.h"
#include "text/files.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "text/trace.h"

namespace qrex {

// Backslashes in front of what is escaped are doubled; elsewhere they stand for themselves. A drive stays as it is:
// CMake would read a backslash there as a folder.
std::string DepfileName(std::string_view path) {
  std::string name(platform::kHasDrives ? DriveOf(path) : "");
  path.remove_prefix(name.size());
  size_t backslashes = 0;
  for (const char c : path) {
    if (c == ' ' || c == '\t') name.append(backslashes + 1, '\\');
    if (c == '#' || c == ':' || c == ';') name += '\\';
    if (c == '$') name += '$';
    name += c;
    backslashes = c == '\\' ? backslashes + 1 : 0;
  }
  return name;
}

namespace {

// To make alone `%` is something else in a target; ninja does not ask for the names of targets.
std::string TargetName(const std::string& path) {
  std::string name = DepfileName(path);
  ReplaceAllInPlace(name, "%", "\\%");
  return name;
}

}  // namespace

bool WriteDepfile(const Workspace& workspace, const std::vector<std::string>& generated) {
  const ConfigSettings& settings = workspace.settings;
  const std::string& path = settings.depfile;
  const bool isGen = settings.mode == RunMode::Gen;
  if (path.empty() || (!isGen && settings.mode != RunMode::Build)) return true;
  PathList targets;
  targets.Add(path);
  if (isGen) targets.Add(workspace.name + ".projects");
  for (const std::string& output : isGen ? generated : OutputsOf(workspace)) targets.Add(output);
  std::string text, emptyRules;
  for (const std::string& target : targets.Take()) text.append(text.empty() ? "" : " ").append(TargetName(target));
  text += ":";
  std::vector<std::string> inputs = InputsOf(workspace);
  for (std::string& folder : ListedFolders(settings)) inputs.push_back(std::move(folder));
  for (const std::string& input : inputs) {
    const std::string name = DepfileName(input);
    text.append(" \\\n  ").append(name);
    const bool isPlainRule = input.find_first_of("%=") == std::string::npos;  // no pattern, no assignment
    if (isPlainRule) emptyRules.append(name).append(":\n");
  }
  try {
    CreateDirectories(path, false);
    settings.leftovers.Beside(path);
    ReplaceFile(path, text + "\n" + emptyRules);
  } catch (const IException& exception) {
    TraceWriter() << "Error: " << exception << "\n";
    return false;
  }
  platform::SetWriteTime(path, settings.begun);
  return true;
}

}  // namespace qrex
