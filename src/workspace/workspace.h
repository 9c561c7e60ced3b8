// All projects of a run: loading, order, identifiers, and the check that no file belongs to two places.
#pragma once

#include <memory>
#include <memory_resource>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "workspace/project_model.h"

namespace qrex {

class Workspace {
 public:
  explicit Workspace(ConfigSettings& settings);

  Project* LoadProject(const std::string& path);  // null when the load failed (already reported)
  void SortProjects();                            // subprojects first; ties keep the load order
  void SyncProjectGuids();                        // reads, applies and writes projects.guids
  bool CheckFileReferences();
  Project* FindProjectByName(std::string_view name) const;  // or null
  Project* FindSubproject(std::string_view path) const;     // by the path's stem; or null
  ProjectFile* FindFile(std::string_view path) const;       // by ProjectFile::path, after CheckFileReferences; or null

  std::vector<std::unique_ptr<Project>> projects;
  ConfigSettings& settings;
  MpfwContext context;
  std::string name;
  std::string rootDir;
  std::string relativeDir;
  std::pmr::monotonic_buffer_resource nodeMemory;  // of fileMap, which only grows
  std::pmr::unordered_map<std::string_view, ProjectFile*> fileMap{&nodeMemory};

 private:
  static constexpr int kMaxLoadDepth = 1000;
  int m_loadDepth = 0;
  std::unordered_map<std::string_view, Project*> m_byName;  // the first of each name among those that are loaded
};

// A project entry without the extension qrpj stands for entry/src/last.qrpj.
std::string ProjectPathOf(const std::string& entry);

}  // namespace qrex
