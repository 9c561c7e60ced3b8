// The files of a workspace for who asks about them: each is translated in memory within its own project. Nothing is
// written.
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "builder/build_files.h"
#include "workspace/workspace.h"

namespace qrex {

class AskedFiles {
 public:
  explicit AskedFiles(Workspace& workspace) : m_workspace(workspace) {}

  // All that a build would translate; what @print and the like write on the way is dropped. False, with messages told,
  // where one of them has an error.
  bool Translate();
  // The translated ones, each once: projects in the order of the build, and the files of each in theirs.
  const std::vector<ScannedFile*>& Files() const { return m_files; }
  // Those with an error, or with an import that has one: what they declare and import is not known.
  const std::vector<ScannedFile*>& FaultyFiles() const { return m_faulty; }

 private:
  bool Translate(Project& project);

  Workspace& m_workspace;
  std::vector<std::unique_ptr<BuildFiles>> m_projects;
  std::vector<ScannedFile*> m_files, m_faulty;
};

// The file that a user means: by its path in the tree, by that of its source or of its translation, from the folder of
// the run on or absolute. Null: it is none of the workspace.
ProjectFile* FindAskedFile(const Workspace& workspace, std::string_view path);

}  // namespace qrex
