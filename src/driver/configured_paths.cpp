#include "driver/configured_paths.h"

#include "platform/console.h"
#include "text/files.h"
#include "text/trace.h"

namespace qrex {

bool FindWorkspaceRoot(const std::string& path, std::string& root, std::string& relative) {
  for (size_t slash = path.rfind('/'); slash != std::string::npos; slash = path.rfind('/', slash - 1)) {
    if (FileExists(path.substr(0, slash) + "/" + kMarkerFile)) {
      root = path.substr(0, slash);
      relative = path.substr(slash + 1);
      return true;
    }
    if (slash == 0) break;
  }
  return false;
}

bool CheckPathSyntax(const ConfigSettings& settings) {
  auto check = [](const std::string& path) {
    if (path.find('\\') != std::string::npos) {
      TraceWriter() << "Forward slashes must be used in argument " << path << "\n";
      return false;
    }
    if (!path.empty() && path.back() == '/') {
      TraceWriter() << "Path can't end with a trailing slash in argument " << path << "\n";
      return false;
    }
    if (!platform::IsValidUtf8(path)) {
      TraceWriter() << "No valid UTF-8 in argument " << path << "\n";
      return false;
    }
    return true;
  };
  for (const std::string& root : settings.virtualTree) {
    if (!check(root)) return false;
  }
  for (const std::string* path :
       {&settings.exportLib, &settings.exportTranslatedInclude, &settings.exportUntranslatedInclude}) {
    if (!check(*path)) return false;
  }
  for (const std::string& entry : settings.workspaces) {
    if (!check(entry)) return false;
  }
  return true;
}

}  // namespace qrex
