#include "generators/generate.h"

#include <string>
#include <type_traits>
#include <unordered_set>

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

// Of the project or workspace at hand. The gcc family has one form of its files, so that the pass with the prefix would
// compose and compare them once more.
std::unordered_set<std::string> upToDate;
bool isSecondPass = false;

void BeginPass(bool buildPrefix) {
  isSecondPass = buildPrefix;
  if (!buildPrefix) upToDate.clear();
}

// Composes one file in memory and hands it over.
template <typename... Args>
void Generate(const std::string& path, void (*write)(TextWriter&, Args...), std::type_identity_t<Args>... args) {
  if (isSecondPass && upToDate.contains(path)) {
    TraceWriter() << "Skipping " << path << "\n";
    return;
  }
  MemoryTextWriter out;
  write(out, args...);
  if (UpdateFile(out, path) != FileUpdate::Failed) upToDate.insert(path);
}

std::string MakeFileName(const std::string& name, const ProjectConfig& config) {
  return "make_" + name + "_" + config.platform + "_" + config.name;
}

void GenerateGccProject(Project& project) {
  if (!project.exported) {
    for (const auto& config : project.configs) {
      Generate(MakeFileName(project.name, *config), WriteProjectMakeFile, project, *config);
    }
  }
  Generate(project.name + ".cbp", WriteCodeBlocksProject, project);
}

std::unordered_set<std::string> ProjectMakeFiles(const Workspace& workspace) {
  std::unordered_set<std::string> names;
  for (const auto& project : workspace.projects) {
    if (project->exported) continue;
    for (const auto& config : project->configs) names.insert(MakeFileName(project->name, *config));
  }
  return names;
}

void GenerateGccWorkspace(const Workspace& workspace) {
  if (workspace.projects.empty()) return;
  const std::unordered_set<std::string> taken = ProjectMakeFiles(workspace);
  for (const auto& config : workspace.projects.front()->configs) {
    const std::string name = MakeFileName(workspace.name, *config);
    if (taken.contains(name)) {  // over the project's, it would call itself
      TraceWriter() << "Error : Make file " << name << " of the workspace has the name of a project's - not written\n";
      continue;
    }
    Generate(name, WriteWorkspaceMakeFile, workspace, *config);
  }
  Generate("makefile", WriteTopMakeFile, workspace);
  Generate(workspace.name + ".make", WriteTopMakeFile, workspace);
  upToDate.erase(workspace.name + ".workspace");  // composed in each pass, as each tells of missing dependencies
  Generate(workspace.name + ".workspace", WriteCodeBlocksWorkspace, workspace);
  Generate(workspace.name + ".geany", WriteGeanyProject, workspace);
}

}  // namespace

void GenerateProjectFile(Project& project, bool buildPrefix) {
  BeginPass(buildPrefix);
  const CompilerKind compiler = project.settings->compiler;
  if (IsGccFamily(compiler)) return GenerateGccProject(project);
  const std::string stem = std::string(NamePrefix(buildPrefix)) + project.name;
  if (compiler == CompilerKind::vc6) {
    Generate(stem + ".dsp", WriteVc6Project, project, buildPrefix);
  } else if (compiler < CompilerKind::vc10) {
    Generate(stem + ".vcproj", WriteVc8Project, project, buildPrefix);
  } else {
    Generate(stem + ".vcxproj", WriteVc10Project, project, buildPrefix);
    Generate(stem + ".vcxproj.filters", WriteVc10Filters, project, buildPrefix);
  }
}

void GenerateWorkspaceFile(Workspace& workspace, bool buildPrefix) {
  BeginPass(buildPrefix);
  const CompilerKind compiler = workspace.settings.compiler;
  if (IsGccFamily(compiler)) return GenerateGccWorkspace(workspace);
  const std::string stem = std::string(NamePrefix(buildPrefix)) + workspace.name;
  if (compiler == CompilerKind::vc6) {
    Generate(stem + ".dsw", WriteVc6Workspace, workspace, buildPrefix);
  } else {
    Generate(stem + ".sln", WriteSolution, workspace, buildPrefix);
  }
}

}  // namespace qrex
