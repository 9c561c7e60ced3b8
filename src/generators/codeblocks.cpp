#include "generators/codeblocks.h"

#include <vector>

#include "build/tools.h"
#include "generators/common.h"
#include "text/numbers.h"
#include "text/paths.h"

namespace qrex {

namespace {

constexpr std::string_view kXmlHead = "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\" ?>\n";

std::string XmlQuote(std::string_view text) {
  std::string quoted;
  ReplaceAll(text, quoted, "\"", "&quot;");
  return quoted;
}

// The words of raw switch text, but for one that the format has an option of its own for.
void WriteSwitches(TextWriter& out, const std::string& text, std::string_view leftOut) {
  std::vector<std::string> words;
  SplitString(text, words, " \t\n\v\f\r");
  for (const std::string& word : words) {
    if (word != leftOut) out << "\t\t\t\t\t<Add option=\"" << XmlQuote(word) << "\" />\n";
  }
}

void WriteTarget(TextWriter& out, const Project& project, const ProjectConfig& config) {
  const bool isDynamic = project.targetType == TargetType::DynamicLinkLibrary;
  const std::string directory = config.platform + "/" + config.name;
  const std::string& exportLib = project.settings->exportLib;
  out << "\t\t\t<Target title=\"" << config.name << "\">\n"
      << "\t\t\t\t<Option output=\"" << exportLib << "/" << directory << "/"
      << (IsLibrary(project.targetType) ? "lib" : "") << project.name
      << "\" prefix_auto=\"1\" extension_auto=\"1\" />\n"
      << "\t\t\t\t<Option object_output=\"" << directory << "/" << project.name << "/\" />\n";
  if (project.targetType == TargetType::ConsoleApplication) out << "\t\t\t\t<Option type=\"1\" />\n";
  if (isDynamic) out << "\t\t\t\t<Option type=\"3\" />\n";
  out << "\t\t\t\t<Option compiler=\"gcc\" />\n";
  if (isDynamic) {
    out << "\t\t\t\t<Option createDefFile=\"1\" />\n"
        << "\t\t\t\t<Option createStaticLib=\"1\" />\n";
  }
  out << "\t\t\t\t<Compiler>\n";
  WriteSwitches(out, config.compilerText, "-MMD");
  out << "\t\t\t\t</Compiler>\n"
      << "\t\t\t\t<Linker>\n";
  WriteSwitches(out, config.linkerText, "-shared");
  if (config.name != "Debug") out << "\t\t\t\t\t<Add option=\"-s\" />\n";
  for (const std::string& path : project.subprojects) {
    out << "\t\t\t\t\t<Add option=\"-l" << SubprojectName(path) << "\" />\n";
  }
  out << "\t\t\t\t\t<Add directory=\"" << exportLib << "/" << directory << "\" />\n"
      << "\t\t\t\t</Linker>\n"
      << "\t\t\t</Target>\n";
}

bool IsUnit(const ProjectFile& file) {
  return file.kind == FileKind::C || file.kind == FileKind::Cpp || file.kind == FileKind::H;
}

// One list for all targets: that of the first configuration. Without one there are no translated files.
void WriteSources(TextWriter& out, const Project& project) {
  static const ProjectConfig kNoConfig;
  const ProjectConfig& config = project.configs.empty() ? kNoConfig : *project.configs.front();
  const bool isTranslated = project.usesQrex && !project.configs.empty();
  out << "\t\t<Compiler>\n";
  for (const std::string& path : IncludePaths(project, config, isTranslated)) {
    out << "\t\t\t<Add option=\"-I" << path << "\" />\n";
  }
  out << "\t\t</Compiler>\n";
  const std::string directory = isTranslated ? CompiledDirectory(project, config) : project.rootDir;
  for (const ProjectFile* file : project.files) {
    if (IsUnit(*file)) out << "\t\t<Unit filename=\"" << directory << "/" << file->path << "\" />\n";
  }
}

}  // namespace

void WriteCodeBlocksProject(TextWriter& out, const Project& project) {
  out << kXmlHead
      << "<CodeBlocks_project_file>\n"
         "\t<FileVersion major=\"1\" minor=\"6\" />\n"
         "\t<Project>\n"
      << "\t\t<Option title=\"" << project.name << "\" />\n"
      << "\t\t<Option pch_mode=\"2\" />\n"
         "\t\t<Option compiler=\"gcc\" />\n"
         "\t\t<Build>\n";
  for (const auto& config : project.configs) WriteTarget(out, project, *config);
  out << "\t\t</Build>\n";
  WriteSources(out, project);
  out << "\t\t<Extensions>\n"
         "\t\t\t<code_completion>\n"
      << "\t\t\t\t<search_path add=\"" << PathJoin(project.rootDir, project.rootToProjDir) << "\" />\n"
      << "\t\t\t\t<search_path add=\"" << PathJoin(project.rootDir, project.sourceDir) << "\" />\n";
  for (const std::string& root : project.settings->virtualTree)
    out << "\t\t\t\t<search_path add=\"" << root << "\" />\n";
  out << "\t\t\t</code_completion>\n"
         "\t\t\t<debugger />\n"
         "\t\t</Extensions>\n"
         "\t</Project>\n"
         "</CodeBlocks_project_file>\n";
}

void WriteCodeBlocksWorkspace(TextWriter& out, const Workspace& workspace) {
  out << kXmlHead
      << "<CodeBlocks_workspace_file>\n"
         "\t<Workspace title=\"Workspace\">\n";
  bool hasActive = false;
  for (const auto& project : workspace.projects) {
    if (project->exported) continue;
    out << "\t\t<Project filename=\"" << project->name << ".cbp\"";
    if (!hasActive && !IsLibrary(project->targetType)) {
      out << " active=\"1\"";
      hasActive = true;
    }
    out << ">\n";
    for (const std::string& path : project->subprojects) {
      const Project* dependency = FindDependency(*project, path);
      if (!dependency || dependency->exported) continue;
      out << "\t\t\t<Depends filename=\"" << dependency->name << ".cbp\" />\n";
    }
    out << "\t\t</Project>\n";
  }
  out << "\t</Workspace>\n"
         "</CodeBlocks_workspace_file>\n";
}

}  // namespace qrex
