// Reads a workspace file: its name, then a tree of projects and nested workspace files.
#pragma once

#include <string>

#include "macro/mpfw_parser.h"
#include "workspace/workspace.h"

namespace qrex {

class WorkspaceParser : public MpfwParser {
 public:
  // `path`: of the file; `outer`: the parser of the file that names it, or null.
  explicit WorkspaceParser(Workspace& workspace, std::string path, const WorkspaceParser* outer = nullptr)
      : MpfwParser(workspace.context), m_workspace(workspace), m_path(std::move(path)), m_outer(outer) {}

  bool ResolveImport(const std::string& path, std::string& found) override;
  std::string ImportHint(const std::string& path) const override;
  void OnImportedFile(MpfwSourceFile&) override {}  // brings macros and variables, no projects

  // On the processed text of a workspace file; the workspace's name.
  std::string ParseWorkspace();

 private:
  void ParseBlock(Project* parent);
  void ParseNested(const std::string& path);
  void ParseProject(const std::string& path, Project* parent);

  Workspace& m_workspace;
  const std::string m_path;
  const WorkspaceParser* const m_outer;
  int m_depth = 0;
};

}  // namespace qrex
