// Reads a workspace file: its name, then a tree of projects and nested workspace files.
#pragma once

#include <string>

#include "macro/mpfw_parser.h"
#include "workspace/workspace.h"

namespace qrex {

class WorkspaceParser : public MpfwParser {
 public:
  explicit WorkspaceParser(Workspace& workspace) : MpfwParser(workspace.context), m_workspace(workspace) {}

  bool ResolveImport(const std::string& path, std::string& found) override;
  void OnImportedFile(MpfwSourceFile&) override {}  // brings macros and variables, no projects

  // On the processed text of a workspace file; the workspace's name.
  std::string ParseWorkspace();

 private:
  void ParseBlock(Project* parent);
  void ParseNested(const std::string& path);
  void ParseProject(const std::string& path, Project* parent);

  Workspace& m_workspace;
  int m_depth = 0;
};

}  // namespace qrex
