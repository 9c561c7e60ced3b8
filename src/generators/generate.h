// Which project, workspace and make files a compiler needs, and under which names.
#pragma once

#include <string>
#include <type_traits>
#include <unordered_set>
#include <vector>

#include "generators/form.h"
#include "text/files.h"
#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

// Writes the files of the projects and workspaces of one run, the plain form of each ahead of the translated one.
// Files land in the current directory, by UpdateFile: a file that cannot be written costs an "Error: " line.
class Generator {
 public:
  explicit Generator(LeftoverSweep& leftovers) : m_leftovers(leftovers) {}
  void WriteProject(Project& project, Form form);
  void WriteWorkspace(Workspace& workspace, Form form);
  const std::vector<std::string>& Files() const { return m_files; }  // that are written, or as they should be

 private:
  void BeginPass(Form form);
  template <typename... Args>
  void Generate(const std::string& path, void (*write)(TextWriter&, Args...), std::type_identity_t<Args>... args);
  void WriteProjectFiles(Project& project, ProjectFormat format);
  void WriteWorkspaceFiles(Workspace& workspace, ProjectFormat format);
  void WriteProjectMakeFiles(Project& project);
  void WriteWorkspaceMakeFiles(const Workspace& workspace);
  void WriteNinja(Workspace& workspace);
  void WriteTopMakeFiles(const Workspace& workspace);

  LeftoverSweep& m_leftovers;
  std::vector<std::string> m_files;
  // Files of the project or workspace that are up to date. The gcc family has one form of its files: the second pass
  // leaves out what the first one wrote.
  std::unordered_set<std::string> m_upToDate;
  Form m_form = Form::Plain;
};

}  // namespace qrex
