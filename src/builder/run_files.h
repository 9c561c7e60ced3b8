// What a run reads and what comes of it, for those who call it or have it called.
#pragma once

#include <string>
#include <unordered_set>
#include <utility>
#include <vector>

#include "workspace/workspace.h"

namespace qrex {

// Takes each path once.
class PathList {
 public:
  void Add(std::string path) {
    if (m_known.insert(path).second) m_paths.push_back(std::move(path));
  }
  std::vector<std::string> Take() { return std::move(m_paths); }

 private:
  std::unordered_set<std::string> m_known;
  std::vector<std::string> m_paths;
};

// What the run's mode reads: configuration, workspaces, projects, what these import, and the sources of translated
// projects. Each once, in the order of reading.
std::vector<std::string> InputsOf(const Workspace& workspace);
// Of these, the files that set something: each once.
std::vector<std::string> SettingFiles(const ConfigSettings& settings);
// Folders whose entries decide what the projects list. That of the run is not among them: its entries change anyway.
std::vector<std::string> ListedFolders(const ConfigSettings& settings);
// What is up to date behind a build. Objects and targets only where the run makes them.
std::vector<std::string> OutputsOf(const Workspace& workspace);

}  // namespace qrex
