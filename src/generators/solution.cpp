#include "generators/solution.h"

#include <set>

#include "generators/common.h"
#include "generators/vs_common.h"

namespace qrex {

namespace {

// The format version and the product, by compiler.
std::string_view Header(CompilerKind compiler) {
  switch (compiler) {
    case CompilerKind::vc8:
      return "Microsoft Visual Studio Solution File, Format Version 9.00\n# Visual Studio 2005\n";
    case CompilerKind::vc9:
      return "Microsoft Visual Studio Solution File, Format Version 10.00\n# Visual Studio 2008\n";
    case CompilerKind::vc10:
      return "Microsoft Visual Studio Solution File, Format Version 11.00\n# Visual Studio 2010\n";
    case CompilerKind::vc11:
      return "Microsoft Visual Studio Solution File, Format Version 12.00\n# Visual Studio 2012\n";
    default:
      return "Microsoft Visual Studio Solution File, Format Version 12.00\n# Visual Studio 2013\n";
  }
}

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

void WriteProject(TextWriter& out, const Project& project, bool buildPrefix) {
  const bool isNewFormat = project.settings->compiler >= CompilerKind::vc10;
  out << "Project(\"{8BC9CEB8-8B4A-11D0-8D11-00A0C91BC942}\") = \"" << project.name << "\", \""
      << NamePrefix(IsTranslatedForm(project, buildPrefix)) << project.name << (isNewFormat ? ".vcxproj" : ".vcproj")
      << "\", \"" << GuidText(project.guid) << "\"\n";
  // The newer project files name their dependencies themselves.
  if (!isNewFormat && !project.subprojects.empty()) WriteDependencies(out, project);
  out << "EndProject\n";
}

// A translated project takes no part in the build of the plain solution.
void WriteConfigurations(TextWriter& out, const Project& project, bool buildPrefix) {
  const bool isBuilt = buildPrefix || !project.usesQrex;
  for (const auto& config : project.configs) {
    const std::string spec = ConfigSpec(*config);
    const std::string key = GuidText(project.guid) + "." + spec;
    out << "\t\t" << key << ".ActiveCfg = " << spec << "\n";
    if (isBuilt) out << "\t\t" << key << ".Build.0 = " << spec << "\n";
  }
}

}  // namespace

void WriteSolution(TextWriter& out, const Workspace& workspace, bool buildPrefix) {
  out << "\xEF\xBB\xBF\n" << Header(workspace.settings.compiler);
  std::set<std::string> specs;  // also those of projects that are not listed
  for (const auto& project : workspace.projects) {
    if (IsListed(*project)) WriteProject(out, *project, buildPrefix);
    for (const auto& config : project->configs) specs.insert(ConfigSpec(*config));
  }
  out << "Global\n"
      << "\tGlobalSection(SolutionConfigurationPlatforms) = preSolution\n";
  for (const std::string& spec : specs) out << "\t\t" << spec << " = " << spec << "\n";
  out << "\tEndGlobalSection\n"
      << "\tGlobalSection(ProjectConfigurationPlatforms) = postSolution\n";
  for (const auto& project : workspace.projects) {
    if (IsListed(*project)) WriteConfigurations(out, *project, buildPrefix);
  }
  out << "\tEndGlobalSection\n"
      << "\tGlobalSection(SolutionProperties) = preSolution\n"
      << "\t\tHideSolutionNode = FALSE\n"
      << "\tEndGlobalSection\n"
      << "EndGlobal\n";
}

}  // namespace qrex
