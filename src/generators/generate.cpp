#include "generators/generate.h"

#include <string>

#include "generators/codeblocks.h"
#include "generators/common.h"
#include "generators/geany.h"
#include "generators/make_files.h"
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
  if (UpdateFile(m_leftovers, out, path) != FileUpdate::Failed) m_upToDate.insert(path);
}

void Generator::WriteGccProject(Project& project) {
  if (!project.exported) {
    for (const auto& config : project.configs) {
      const std::string name = MakeFileName(project.name, *config);
      if (MakeTakes(m_form, name, NameThatMakeReads(project, *config)))
        Generate(name, WriteProjectMakeFile, project, *config);
    }
  }
  Generate(project.name + ".cbp", WriteCodeBlocksProject, project);
}

void Generator::WriteTopMakeFiles(const Workspace& workspace) {
  const auto& configs = workspace.projects.front()->configs;
  if (!MakeTakes(m_form, "makefile", configs.empty() ? "" : NameThatMakeReads(workspace, *configs.front()))) return;
  Generate("makefile", WriteTopMakeFile, workspace);
  Generate(workspace.name + ".make", WriteTopMakeFile, workspace);
}

void Generator::WriteGccWorkspace(const Workspace& workspace) {
  if (workspace.projects.empty()) return;
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
  m_upToDate.erase(workspace.name + ".workspace");  // composed in each pass, as each tells of missing dependencies
  Generate(workspace.name + ".workspace", WriteCodeBlocksWorkspace, workspace);
  Generate(workspace.name + ".geany", WriteGeanyProject, workspace);
}

void Generator::WriteProject(Project& project, Form form) {
  BeginPass(form);
  const std::string stem = std::string(NamePrefix(form)) + project.name;
  switch (CompilerOf(project.settings->compiler).format) {
    case ProjectFormat::Dsp:
      return Generate(stem + ".dsp", WriteVc6Project, project, form);
    case ProjectFormat::Vcproj:
      return Generate(stem + ".vcproj", WriteVc8Project, project, form);
    case ProjectFormat::Vcxproj:
      Generate(stem + ".vcxproj", WriteVc10Project, project, form);
      return Generate(stem + ".vcxproj.filters", WriteVc10Filters, project, form);
    case ProjectFormat::Make:
      return WriteGccProject(project);
  }
}

void Generator::WriteWorkspace(Workspace& workspace, Form form) {
  BeginPass(form);
  const std::string stem = std::string(NamePrefix(form)) + workspace.name;
  switch (CompilerOf(workspace.settings.compiler).format) {
    case ProjectFormat::Dsp:
      return Generate(stem + ".dsw", WriteVc6Workspace, workspace, form);
    case ProjectFormat::Vcproj:
    case ProjectFormat::Vcxproj:
      return Generate(stem + ".sln", WriteSolution, workspace, form);
    case ProjectFormat::Make:
      return WriteGccWorkspace(workspace);
  }
}

}  // namespace qrex
