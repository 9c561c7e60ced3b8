#include "generators/vc8_project.h"

#include <algorithm>
#include <vector>

#include "generators/common.h"
#include "generators/vs_common.h"
#include "generators/xml.h"
#include "text/numbers.h"
#include "text/paths.h"

namespace qrex {

namespace {

std::string Backslashed(std::string_view path) {
  std::string text;
  ReplaceChar(path, text, '/', '\\');
  return text;
}

std::string_view ConfigurationType(TargetType type) {
  static constexpr std::string_view kNumbers[] = {"1", "4", "1", "2", "10"};
  return kNumbers[static_cast<size_t>(type)];
}

class ProjectWriter {
 public:
  ProjectWriter(TextWriter& out, Project& project, Form form)
      : m_xml(out, XmlLayout::AttributeLines),
        m_project(project),
        m_form(form),
        m_filesBase(IsTranslatedForm(project, form) ? "qrexsource/$(PlatformName)/$(ConfigurationName)"
                                                    : project.rootDir) {}
  void WriteAll();

 private:
  void WritePlatforms();
  void WriteToolFiles();
  void WriteConfigurations();
  void WriteConfiguration(const ProjectConfig& config);
  void WriteEvent(const BuildEvent& event, std::string_view tool);
  void WriteTools(const ProjectConfig& config);
  void WriteTool(std::string_view tool, const OptionMap& options, const ProjectConfig& config);
  void WriteFolder(const ProjectFolder& folder);
  void WriteFile(const ProjectFile& file);
  void WriteFileConfiguration(const ProjectFile& file, const ProjectConfig& config);
  void WriteCompilerTool(const FileConfigRecord* record, const ProjectConfig& config);
  void WriteAssemblerTool(const ProjectConfig& config);

  XmlWriter m_xml;
  Project& m_project;
  const Form m_form;
  const std::string m_filesBase;
};

void AddAttributes(std::vector<XmlAttribute>& attributes, const OptionMap& options) {
  for (const auto& [property, value] : options) attributes.push_back({property, value});
}

void ProjectWriter::WriteAll() {
  m_project.CollectFiles();
  const XmlElement project(m_xml, "VisualStudioProject",
                           {{"ProjectType", "Visual C++"},
                            {"Version", CompilerOf(m_project.settings->compiler).projectVersion},
                            {"Name", m_project.name},
                            {"ProjectGUID", GuidText(m_project.guid)}});
  WritePlatforms();
  WriteToolFiles();
  WriteConfigurations();
  { const XmlElement references(m_xml, "References"); }
  {
    const XmlElement files(m_xml, "Files");
    WriteFolder(m_project.rootFolder);
  }
  const XmlElement globals(m_xml, "Globals");
}

void ProjectWriter::WritePlatforms() {
  std::vector<std::string_view> platforms;
  for (const auto& config : m_project.configs) {
    if (std::find(platforms.begin(), platforms.end(), config->platform) == platforms.end()) {
      platforms.push_back(config->platform);
    }
  }
  const XmlElement element(m_xml, "Platforms");
  for (std::string_view platform : platforms) m_xml.Empty("Platform", {{"Name", platform}});
}

void ProjectWriter::WriteToolFiles() {
  const XmlElement element(m_xml, "ToolFiles");
  for (const std::string& path : m_project.toolFiles) m_xml.Empty("ToolFile", {{"RelativePath", Backslashed(path)}});
}

void ProjectWriter::WriteConfigurations() {
  const XmlElement element(m_xml, "Configurations");
  for (const auto& config : m_project.configs) WriteConfiguration(*config);
}

void ProjectWriter::WriteConfiguration(const ProjectConfig& config) {
  const std::string name = ConfigSpec(config);
  std::vector<XmlAttribute> attributes = {{"Name", name}};
  AddAttributes(attributes, config.generalOptions);
  if (!config.generalOptions.contains("ConfigurationType")) {
    attributes.push_back({"ConfigurationType", ConfigurationType(m_project.targetType)});
  }
  if (!config.generalOptions.contains("ManagedExtensions")) {
    auto managed = config.compilerOptions.find("ManagedExtensions");
    const bool isUnknown = managed == config.compilerOptions.end();
    attributes.push_back({"ManagedExtensions", isUnknown ? std::string_view("0") : managed->second});
  }
  const XmlElement element(m_xml, "Configuration", attributes);
  WriteEvent(config.preBuildEvent, "VCPreBuildEventTool");
  WriteEvent(config.preLinkEvent, "VCPreLinkEventTool");
  WriteEvent(config.postBuildEvent, "VCPostBuildEventTool");
  if (m_project.targetType != TargetType::UtilityProject) WriteTools(config);
}

void ProjectWriter::WriteEvent(const BuildEvent& event, std::string_view tool) {
  if (!event.present) return;
  m_xml.Empty("Tool", {{"Name", tool}, {"Description", event.description}, {"CommandLine", event.commandLine}});
}

void ProjectWriter::WriteTools(const ProjectConfig& config) {
  OptionMap compilerOptions = config.compilerOptions;
  compilerOptions.erase("UsePrecompiledHeader");  // written for each source
  compilerOptions.erase("ManagedExtensions");
  WriteTool("VCCLCompilerTool", compilerOptions, config);
  WriteTool("VCResourceCompilerTool", config.resourceOptions, config);
  const bool isArchive = m_project.targetType == TargetType::StaticLibrary;
  WriteTool(isArchive ? "VCLibrarianTool" : "VCLinkerTool", LinkerOptions(m_project, config), config);
}

void ProjectWriter::WriteTool(std::string_view tool, const OptionMap& options, const ProjectConfig& config) {
  std::string includes;
  std::vector<XmlAttribute> attributes = {{"Name", tool}};
  for (const auto& [property, value] : options) {
    const bool isIncludes = property == "AdditionalIncludeDirectories";
    if (isIncludes) includes = IncludeList(m_project, config, value, m_form);
    attributes.push_back({property, isIncludes ? includes : value});
  }
  m_xml.Empty("Tool", attributes);
}

// --- Files

void ProjectWriter::WriteFolder(const ProjectFolder& folder) {
  for (const auto& subfolder : folder.subfolders) {
    const XmlElement filter(m_xml, "Filter", {{"Name", subfolder->name}});
    if (HoldsProjectFile(m_project, folder, *subfolder, m_form)) {
      const XmlElement file(m_xml, "File", {{"RelativePath", Backslashed(ProjectFileEntry(m_project, m_filesBase))}});
    }
    WriteFolder(*subfolder);
  }
  for (const ProjectFile* file : folder.files) {
    if (!IsLeftOut(m_project, *file)) WriteFile(*file);
  }
}

void ProjectWriter::WriteFile(const ProjectFile& file) {
  const XmlElement element(m_xml, "File", {{"RelativePath", Backslashed(PathJoin(m_filesBase, file.path))}});
  if (file.kind == FileKind::C || file.kind == FileKind::Cpp || file.kind == FileKind::Rc ||
      file.kind == FileKind::Asm) {
    for (const auto& config : m_project.configs) WriteFileConfiguration(file, *config);
  }
}

void ProjectWriter::WriteFileConfiguration(const ProjectFile& file, const ProjectConfig& config) {
  const FileConfigRecord* record = file.FindRecord(config);
  const std::string name = ConfigSpec(config);
  std::vector<XmlAttribute> attributes = {{"Name", name}};
  if (file.excluded || (record && record->excluded)) attributes.push_back({"ExcludedFromBuild", "true"});
  const XmlElement element(m_xml, "FileConfiguration", attributes);
  if (file.kind == FileKind::Rc) {
    m_xml.Empty("Tool", {{"Name", "VCResourceCompilerTool"}});
  } else if (file.kind == FileKind::Asm) {
    WriteAssemblerTool(config);
  } else {
    WriteCompilerTool(record, config);
  }
}

void ProjectWriter::WriteCompilerTool(const FileConfigRecord* record, const ProjectConfig& config) {
  OptionMap options = record ? record->options : OptionMap();
  auto inherited = config.compilerOptions.find("UsePrecompiledHeader");
  if (inherited != config.compilerOptions.end()) options.insert(*inherited);
  std::vector<XmlAttribute> attributes = {{"Name", "VCCLCompilerTool"}};
  AddAttributes(attributes, options);
  m_xml.Empty("Tool", attributes);
}

void ProjectWriter::WriteAssemblerTool(const ProjectConfig& config) {
  const std::string object =
      R"(&quot;$(ProjectDir)$(PlatformName)\$(ConfigurationName)\$(ProjectName)\$(InputName).obj&quot;)";
  const bool isWin64 = config.platform == "Win64";
  const std::string command = std::string("&quot;$(VCInstallDir)bin") + (isWin64 ? R"(\x86_amd64\ml64)" : R"(\ml)") +
                              "&quot; /c /Cx" + (isWin64 ? " /D _M_X64" : " /coff") + " /Fo " + object +
                              " &quot;$(InputPath)&quot;";
  m_xml.Empty("Tool", {{"Name", "VCCustomBuildTool"}, {"CommandLine", command}, {"Outputs", object}});
}

}  // namespace

void WriteVc8Project(TextWriter& out, Project& project, Form form) {
  out << "<?xml version=\"1.0\" encoding=\"Windows-1252\"?>\n";
  ProjectWriter(out, project, form).WriteAll();
}

}  // namespace qrex
