#include "generators/codeblocks.h"

#include <vector>

#include "builder/source_command.h"
#include "generators/common.h"
#include "generators/xml.h"
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
void WriteSwitches(XmlWriter& xml, const std::string& text, std::string_view leftOut) {
  std::vector<std::string> words;
  SplitString(text, words, " \t\n\v\f\r");
  for (const std::string& word : words) {
    if (word != leftOut) xml.Empty("Add", {{"option", XmlQuote(word)}});
  }
}

void WriteTarget(XmlWriter& xml, const Project& project, const ProjectConfig& config) {
  const bool isDynamic = project.targetType == TargetType::DynamicLinkLibrary;
  const std::string directory = config.platform + "/" + config.name;
  const std::string exportDirectory = project.settings->exportLib + "/" + directory;
  const std::string output = exportDirectory + "/" + (IsLibrary(project.targetType) ? "lib" : "") + project.name;
  const XmlElement target(xml, "Target", {{"title", config.name}});
  xml.Empty("Option", {{"output", output}, {"prefix_auto", "1"}, {"extension_auto", "1"}});
  xml.Empty("Option", {{"object_output", directory + "/" + project.name + "/"}});
  if (project.targetType == TargetType::ConsoleApplication) xml.Empty("Option", {{"type", "1"}});
  if (isDynamic) xml.Empty("Option", {{"type", "3"}});
  xml.Empty("Option", {{"compiler", "gcc"}});
  if (isDynamic) {
    xml.Empty("Option", {{"createDefFile", "1"}});
    xml.Empty("Option", {{"createStaticLib", "1"}});
  }
  {
    const XmlElement compiler(xml, "Compiler");
    WriteSwitches(xml, CommonSwitchesOf(project, config).raw, "-MMD");
  }
  const XmlElement linker(xml, "Linker");
  WriteSwitches(xml, config.linkerText, "-shared");
  if (config.name != "Debug") xml.Empty("Add", {{"option", "-s"}});
  for (const std::string& path : project.subprojects) xml.Empty("Add", {{"option", "-l" + SubprojectName(path)}});
  xml.Empty("Add", {{"directory", exportDirectory}});
}

bool IsUnit(const ProjectFile& file) {
  return file.kind == FileKind::C || file.kind == FileKind::Cpp || file.kind == FileKind::H;
}

// One list for all targets: that of the first configuration. Without one there are no translated files.
void WriteSources(XmlWriter& xml, const Project& project) {
  static const ProjectConfig kNoConfig;
  const ProjectConfig& config = project.configs.empty() ? kNoConfig : *project.configs.front();
  const bool isTranslated = project.usesQrex && !project.configs.empty();
  {
    const XmlElement compiler(xml, "Compiler");
    for (const std::string& path : IncludePaths(project, config, isTranslated)) {
      xml.Empty("Add", {{"option", "-I" + path}});
    }
  }
  std::string path = (isTranslated ? CompiledDirectory(project, config) : project.rootDir) + "/";
  const size_t directorySize = path.size();
  for (const ProjectFile* file : project.files) {
    if (!IsUnit(*file)) continue;
    path.replace(directorySize, std::string::npos, file->path);
    xml.Empty("Unit", {{"filename", path}});
  }
}

void WriteExtensions(XmlWriter& xml, const Project& project) {
  const XmlElement extensions(xml, "Extensions");
  {
    const XmlElement completion(xml, "code_completion");
    xml.Empty("search_path", {{"add", PathJoin(project.rootDir, project.rootToProjDir)}});
    xml.Empty("search_path", {{"add", PathJoin(project.rootDir, project.sourceDir)}});
    for (const std::string& root : project.settings->virtualTree) xml.Empty("search_path", {{"add", root}});
  }
  xml.Empty("debugger");
}

}  // namespace

void WriteCodeBlocksProject(TextWriter& out, const Project& project) {
  out << kXmlHead;
  XmlWriter xml(out, XmlLayout::Tabs);
  const XmlElement file(xml, "CodeBlocks_project_file");
  xml.Empty("FileVersion", {{"major", "1"}, {"minor", "6"}});
  const XmlElement element(xml, "Project");
  xml.Empty("Option", {{"title", project.name}});
  xml.Empty("Option", {{"pch_mode", "2"}});
  xml.Empty("Option", {{"compiler", "gcc"}});
  {
    const XmlElement build(xml, "Build");
    for (const auto& config : project.configs) WriteTarget(xml, project, *config);
  }
  WriteSources(xml, project);
  WriteExtensions(xml, project);
}

void WriteCodeBlocksWorkspace(TextWriter& out, const Workspace& workspace) {
  out << kXmlHead;
  XmlWriter xml(out, XmlLayout::Tabs);
  const XmlElement file(xml, "CodeBlocks_workspace_file");
  const XmlElement element(xml, "Workspace", {{"title", "Workspace"}});
  bool hasActive = false;
  for (const auto& project : workspace.projects) {
    if (project->exported) continue;
    const std::string filename = project->name + ".cbp";
    std::vector<XmlAttribute> attributes = {{"filename", filename}};
    if (!hasActive && !IsLibrary(project->targetType)) {
      attributes.push_back({"active", "1"});
      hasActive = true;
    }
    const XmlElement entry(xml, "Project", attributes);
    for (const std::string& path : project->subprojects) {
      const Project* dependency = FindDependency(*project, path);
      if (!dependency || dependency->exported) continue;
      xml.Empty("Depends", {{"filename", dependency->name + ".cbp"}});
    }
  }
}

}  // namespace qrex
