#include "generators/solution.h"

#include <set>

#include "generators/common.h"
#include "generators/vs_common.h"

namespace qrex {

namespace {

bool IsListed(const Project& project) {
  return !project.exported || project.settings->solutionContainsPrepackagedProjects;
}

void WriteDependencies(TextWriter& out, const Project& project) {
  out << "\tProjectSection(ProjectDependencies) = postProject\n";
  for (const std::string& path : project.subprojects) {
    const Project* dependency = FindDependency(project, path);
    if (!dependency || dependency->exported) continue;
    out << "\t\t" << GuidText(dependency->guid) << " = " << GuidText(dependency->guid) << "\n";
  }
  out << "\tEndProjectSection\n";
}

void WriteProject(TextWriter& out, const Project& project, Form form) {
  const bool isNewFormat = CompilerOf(project.settings->compiler).format == ProjectFormat::Vcxproj;
  out << "Project(\"{8BC9CEB8-8B4A-11D0-8D11-00A0C91BC942}\") = \"" << project.name << "\", \""
      << NamePrefix(FormOf(project, form)) << project.name << (isNewFormat ? ".vcxproj" : ".vcproj") << "\", \""
      << GuidText(project.guid) << "\"\n";
  // The newer project files name their dependencies themselves.
  if (!isNewFormat && !project.subprojects.empty()) WriteDependencies(out, project);
  out << "EndProject\n";
}

// A translated project takes no part in the build of the plain solution.
void WriteConfigurations(TextWriter& out, const Project& project, Form form) {
  const bool isBuilt = form == Form::Translated || !project.usesQrex;
  for (const auto& config : project.configs) {
    const std::string spec = ConfigSpec(*config);
    const std::string key = GuidText(project.guid) + "." + spec;
    out << "\t\t" << key << ".ActiveCfg = " << spec << "\n";
    if (isBuilt) out << "\t\t" << key << ".Build.0 = " << spec << "\n";
  }
}

}  // namespace

void WriteSolution(TextWriter& out, const Workspace& workspace, Form form) {
  out << "\xEF\xBB\xBF\n" << CompilerOf(workspace.settings.compiler).solutionHeader;
  std::set<std::string> specs;  // also those of projects that are not listed
  for (const auto& project : workspace.projects) {
    if (IsListed(*project)) WriteProject(out, *project, form);
    for (const auto& config : project->configs) specs.insert(ConfigSpec(*config));
  }
  out << "Global\n"
      << "\tGlobalSection(SolutionConfigurationPlatforms) = preSolution\n";
  for (const std::string& spec : specs) out << "\t\t" << spec << " = " << spec << "\n";
  out << "\tEndGlobalSection\n"
      << "\tGlobalSection(ProjectConfigurationPlatforms) = postSolution\n";
  for (const auto& project : workspace.projects) {
    if (IsListed(*project)) WriteConfigurations(out, *project, form);
  }
  out << "\tEndGlobalSection\n"
      << "\tGlobalSection(SolutionProperties) = preSolution\n"
      << "\t\tHideSolutionNode = FALSE\n"
      << "\tEndGlobalSection\n"
      << "EndGlobal\n";
}

}  // namespace qrex
