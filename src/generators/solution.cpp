#include "generators/solution.h"

#include <set>

#include "generators/common.h"
#include "generators/vs_common.h"
#include "translator/emit/write.h"

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
    Write(out, "\t\t$guid$ = $guid$\n", "guid"_ = GuidText(dependency->guid));
  }
  out << "\tEndProjectSection\n";
}

void WriteProject(TextWriter& out, const Project& project, Form form) {
  const bool isNewFormat = CompilerOf(project.settings->compiler).Writes(ProjectFormat::Vcxproj);
  auto writeDependencies = [&] {
    // The newer project files name their dependencies themselves.
    if (!isNewFormat && !project.subprojects.empty()) WriteDependencies(out, project);
  };
  Write(out, R"(
    Project("{8BC9CEB8-8B4A-11D0-8D11-00A0C91BC942}") = "$name$", "$prefix$$name$$extension$", "$guid$"
    $dependencies$
    EndProject
  )",
        "name"_ = project.name, "prefix"_ = NamePrefix(FormOf(project, form)),
        "extension"_ = isNewFormat ? ".vcxproj" : ".vcproj", "guid"_ = GuidText(project.guid),
        "dependencies"_ = writeDependencies);
}

// A translated project takes no part in the build of the plain solution.
void WriteConfigurations(TextWriter& out, const Project& project, Form form) {
  const bool isBuilt = form == Form::Translated || !project.usesQrex;
  const std::string guid = GuidText(project.guid);
  for (const auto& config : project.configs) {
    const std::string spec = ConfigSpec(*config);
    Write(out, "\t\t$guid$.$spec$.ActiveCfg = $spec$\n", "guid"_ = guid, "spec"_ = spec);
    if (isBuilt) Write(out, "\t\t$guid$.$spec$.Build.0 = $spec$\n", "guid"_ = guid, "spec"_ = spec);
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
  auto writeSpec = [&](const std::string& spec) { Write(out, "\t\t$spec$ = $spec$\n", "spec"_ = spec); };
  auto writeConfigurations = [&](const auto& project) {
    if (IsListed(*project)) WriteConfigurations(out, *project, form);
  };
  Write(out,
        "Global\n"
        "\tGlobalSection(SolutionConfigurationPlatforms) = preSolution\n"
        "$platforms$"
        "\tEndGlobalSection\n"
        "\tGlobalSection(ProjectConfigurationPlatforms) = postSolution\n"
        "$configurations$"
        "\tEndGlobalSection\n"
        "\tGlobalSection(SolutionProperties) = preSolution\n"
        "\t\tHideSolutionNode = FALSE\n"
        "\tEndGlobalSection\n"
        "EndGlobal\n",
        "platforms"_ = Each(out, specs, "", writeSpec),
        "configurations"_ = Each(out, workspace.projects, "", writeConfigurations));
}

}  // namespace qrex
