#include "generators/generate.h"

#include <string>

#include "generators/codeblocks.h"
#include "generators/common.h"
#include "generators/geany.h"
#include "generators/make_files.h"
#include "generators/ninja_file.h"
#include "generators/solution.h"
#include "generators/vc10_project.h"
#include "generators/vc6_project.h"
#include "generators/vc8_project.h"
#include "text/output_policy.h"

namespace qrex {

namespace {

std::string MakeFileName(const std::string& name, const ProjectConfig& config) {
  return "make_" + name + "_" + config.platform + "_" + config.name;
}

bool MakeTakes(Form form, const std::string& makeFile, const std::string& hostileName) {
  if (hostileName.empty()) return true;
  if (form == Form::Translated) return false;  // the first pass has said it
  TraceWriter() << "Error : Make file " << makeFile << " would run parts of the name " << hostileName
                << " - not written\n";
  return false;
}

std::unordered_set<std::string> ProjectMakeFiles(const Workspace& workspace) {
  std::unordered_set<std::string> names;
  for (const auto& project : workspace.projects) {
    if (project->exported) continue;
    for (const auto& config : project->configs) names.insert(MakeFileName(project->name, *config));
  }
  return names;
}

}  // namespace

void Generator::BeginPass(Form form) {
  m_form = form;
  if (form == Form::Plain) m_upToDate.clear();
}

// Composes one file in memory and hands it over.
template <typename... Args>
void Generator::Generate(const std::string& path, void (*write)(TextWriter&, Args...),
                         std::type_identity_t<Args>... args) {
  if (m_form == Form::Translated && m_upToDate.contains(path)) {
    TraceWriter() << "Skipping " << path << "\n";
    return;
  }
  MemoryTextWriter out;
  write(out, args...);
  if (UpdateFile(m_leftovers, out, path) == FileUpdate::Failed) return;
  if (m_upToDate.insert(path).second) m_files.push_back(path);
}

void Generator::WriteProjectMakeFiles(Project& project) {
  if (project.exported) return;
  for (const auto& config : project.configs) {
    const std::string name = MakeFileName(project.name, *config);
    if (MakeTakes(m_form, name, NameThatMakeReads(project, *config)))
      Generate(name, WriteProjectMakeFile, project, *config);
  }
}

void Generator::WriteTopMakeFiles(const Workspace& workspace) {
  const auto& configs = workspace.projects.front()->configs;
  if (!MakeTakes(m_form, "makefile", configs.empty() ? "" : NameThatMakeReads(workspace, *configs.front()))) return;
  Generate("makefile", WriteTopMakeFile, workspace);
  Generate(workspace.name + ".make", WriteTopMakeFile, workspace);
}

void Generator::WriteWorkspaceMakeFiles(const Workspace& workspace) {
  const std::unordered_set<std::string> taken = ProjectMakeFiles(workspace);
  for (const auto& config : workspace.projects.front()->configs) {
    const std::string name = MakeFileName(workspace.name, *config);
    if (taken.contains(name)) {  // over the project's, it would call itself
      TraceWriter() << "Error : Make file " << name << " of the workspace has the name of a project's - not written\n";
      continue;
    }
    if (!MakeTakes(m_form, name, NameThatMakeReads(workspace, *config))) continue;
    Generate(name, WriteWorkspaceMakeFile, workspace, *config);
  }
  WriteTopMakeFiles(workspace);
}

void Generator::WriteNinja(Workspace& workspace) {
  if (!workspace.settings.ninja || workspace.projects.empty() || workspace.projects.front()->configs.empty()) return;
  if (const std::string name = NameThatNinjaLacks(workspace); !name.empty()) {
    if (m_form == Form::Plain)
      TraceWriter() << "Error : Ninja files can't have the name " << name << " - not written\n";
    return;
  }
  Generate("build.ninja", WriteNinjaFile, workspace);
}

void Generator::WriteProjectFiles(Project& project, ProjectFormat format) {
  const std::string stem = std::string(NamePrefix(m_form)) + project.name;
  switch (format) {
    case ProjectFormat::Dsp:
      return Generate(stem + ".dsp", WriteVc6Project, project, m_form);
    case ProjectFormat::Vcproj:
      return Generate(stem + ".vcproj", WriteVc8Project, project, m_form);
    case ProjectFormat::Vcxproj:
      Generate(stem + ".vcxproj", WriteVc10Project, project, m_form);
      return Generate(stem + ".vcxproj.filters", WriteVc10Filters, project, m_form);
    case ProjectFormat::Make:
      return WriteProjectMakeFiles(project);
    case ProjectFormat::CodeBlocks:
      return Generate(project.name + ".cbp", WriteCodeBlocksProject, project);
    case ProjectFormat::Ninja:
    case ProjectFormat::Geany:  // have a file for the workspace alone
      return;
  }
}

void Generator::WriteWorkspaceFiles(Workspace& workspace, ProjectFormat format) {
  const std::string stem = std::string(NamePrefix(m_form)) + workspace.name;
  switch (format) {
    case ProjectFormat::Dsp:
      return Generate(stem + ".dsw", WriteVc6Workspace, workspace, m_form);
    case ProjectFormat::Vcproj:
    case ProjectFormat::Vcxproj:
      return Generate(stem + ".sln", WriteSolution, workspace, m_form);
    case ProjectFormat::Make:
      if (!workspace.projects.empty()) WriteWorkspaceMakeFiles(workspace);
      return;
    case ProjectFormat::Ninja:
      return WriteNinja(workspace);
    case ProjectFormat::CodeBlocks:
      if (workspace.projects.empty()) return;
      m_upToDate.erase(workspace.name + ".workspace");  // composed in each pass, as each tells of missing dependencies
      return Generate(workspace.name + ".workspace", WriteCodeBlocksWorkspace, workspace);
    case ProjectFormat::Geany:
      if (!workspace.projects.empty()) Generate(workspace.name + ".geany", WriteGeanyProject, workspace);
      return;
  }
}

void Generator::WriteProject(Project& project, Form form) {
  BeginPass(form);
  for (const ProjectFormat format : CompilerOf(project.settings->compiler).formats) WriteProjectFiles(project, format);
}

void Generator::WriteWorkspace(Workspace& workspace, Form form) {
  BeginPass(form);
  for (const ProjectFormat format : CompilerOf(workspace.settings.compiler).formats) {
    WriteWorkspaceFiles(workspace, format);
  }
}

}  // namespace qrex
