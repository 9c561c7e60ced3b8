#include "workspace/workspace_parser.h"

#include "lex/literals.h"
#include "platform/system.h"
#include "text/output_policy.h"
#include "text/paths.h"

namespace qrex {

namespace {
constexpr int kMaxNesting = 1000;
}

bool WorkspaceParser::ResolveImport(const std::string& path, std::string& found) {
  return FindImport(m_workspace.settings, path, found);
}

std::string WorkspaceParser::ImportHint(const std::string& path) const {
  return TriedImports(m_workspace.settings, path);
}

std::string WorkspaceParser::ParseWorkspace() {
  while (ParseImportStatement()) {
  }
  if (current.kind != kDoubleQuoted) {
    throw LexScannerException("Expected double quoted string when read " + Printed(current), current);
  }
  std::string name;
  ReadString(name);
  Advance();
  ParseBlock(nullptr);
  return name;
}

// Leaves the closing `}` as the current token: what is behind the top block is not looked at.
void WorkspaceParser::ParseBlock(Project* parent) {
  if (current.kind != kOpenBrace) {
    throw LexScannerException("Expected { when read " + Printed(current), current);
  }
  if (++m_depth > kMaxNesting || platform::IsStackShort())
    throw LexScannerException("Blocks nested too deeply", current);
  Advance();
  while (current.kind != kCloseBrace) {
    if (current.kind != kDoubleQuoted) {
      throw LexScannerException("Expected double quoted string when read " + Printed(current), current);
    }
    std::string path;
    ReadPath(path);
    Advance();
    if (HasExtension(path, "qrws")) {
      ParseNested(path);
    } else {
      ParseProject(ProjectPathOf(path), parent);
    }
  }
  --m_depth;
}

void WorkspaceParser::ParseNested(const std::string& path) {
  std::string root, fullPath;
  const bool exists = FindInTree(m_workspace.settings, path, root, fullPath);
  if (!exists) {
    throw LexScannerException("Couldn't open workspace file " + path, previous)
        .WithHint(TriedInTree(m_workspace.settings, path));
  }
  CopyIfNewer(m_workspace.settings.leftovers, fullPath, m_workspace.settings.exportUntranslatedInclude + "/" + path,
              true);
  for (const WorkspaceParser* open = this; open; open = open->m_outer) {
    if (open->m_path == fullPath) throw LexScannerException("Workspace file includes itself : " + path, previous);
  }
  if (m_depth >= kMaxNesting || platform::IsStackShort())
    throw LexScannerException("Workspace files nested too deeply", previous);
  WorkspaceParser nested(m_workspace, fullPath, this);
  nested.m_depth = m_depth;
  MpfwSourceFile* file = LoadSourceFile(fullPath);
  if (!file) throw LexScannerException("Error in workspace file " + fullPath, previous);
  const TextRange expansion{std::string_view(file->expansion)};
  try {
    nested.SetInput(expansion);
    nested.ParseWorkspace();
  } catch (LexScannerException& exception) {
    MapErrorPosition(file->map, expansion, exception);
    context.rootFrame.World().messages->Take(ParseErrorOf(context.sourceFiles, exception));
    throw LexScannerException("while reading workspace file " + path, previous);
  }
}

void WorkspaceParser::ParseProject(const std::string& path, Project* parent) {
  if (parent) parent->AddSubproject(path);
  Project* project = m_workspace.LoadProject(path);
  if (!project) throw LexScannerException("while reading project file " + path, previous);
  if (current.kind != kOpenBrace) return;
  ParseBlock(project);
  Advance();
}

}  // namespace qrex
