#include "generators/vc8_project.h"

#include <algorithm>
#include <vector>

#include "generators/common.h"
#include "generators/vs_common.h"
#include "text/numbers.h"
#include "text/paths.h"

namespace qrex {

namespace {

std::string Tabs(int count) { return std::string(static_cast<size_t>(count), '\t'); }

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
      : m_out(out),
        m_project(project),
        m_form(form),
        m_filesBase(IsTranslatedForm(project, form) ? "qrexsource/$(PlatformName)/$(ConfigurationName)"
                                                    : project.rootDir) {}
  void Write();

 private:
  void WritePlatforms();
  void WriteConfiguration(const ProjectConfig& config);
  void WriteEvent(const BuildEvent& event, std::string_view tool);
  void WriteTool(std::string_view tool, const OptionMap& options, const ProjectConfig& config);
  void WriteFolder(const ProjectFolder& folder, int depth);
  void WriteFile(const ProjectFile& file, int depth);
  void WriteFileConfiguration(const ProjectFile& file, const ProjectConfig& config, int depth);
  void WriteAssemblerTool(const ProjectConfig& config, int depth);
  void OpenFile(const std::string& path, int depth);
  void WriteAttribute(int depth, std::string_view name, std::string_view value);
  void WriteAttributes(int depth, const OptionMap& options);

  TextWriter& m_out;
  Project& m_project;
  const Form m_form;
  const std::string m_filesBase;
};

void ProjectWriter::Write() {
  m_project.CollectFiles();
  m_out << "<?xml version=\"1.0\" encoding=\"Windows-1252\"?>\n"
        << "<VisualStudioProject\n"
        << "\tProjectType=\"Visual C++\"\n"
        << "\tVersion=\"" << CompilerOf(m_project.settings->compiler).projectVersion << "\"\n"
        << "\tName=\"" << m_project.name << "\"\n"
        << "\tProjectGUID=\"" << GuidText(m_project.guid) << "\"\n"
        << "\t>\n";
  WritePlatforms();
  m_out << "\t<ToolFiles>\n";
  for (const std::string& path : m_project.toolFiles) {
    m_out << "\t\t<ToolFile\n"
          << "\t\t\tRelativePath=\"" << Backslashed(path) << "\"\n"
          << "\t\t/>\n";
  }
  m_out << "\t</ToolFiles>\n"
        << "\t<Configurations>\n";
  for (const auto& config : m_project.configs) WriteConfiguration(*config);
  m_out << "\t</Configurations>\n"
        << "\t<References>\n"
        << "\t</References>\n"
        << "\t<Files>\n";
  WriteFolder(m_project.rootFolder, 2);
  m_out << "\t</Files>\n"
        << "\t<Globals>\n"
        << "\t</Globals>\n"
        << "</VisualStudioProject>\n";
}

void ProjectWriter::WritePlatforms() {
  std::vector<std::string_view> platforms;
  for (const auto& config : m_project.configs) {
    if (std::find(platforms.begin(), platforms.end(), config->platform) == platforms.end()) {
      platforms.push_back(config->platform);
    }
  }
  m_out << "\t<Platforms>\n";
  for (std::string_view platform : platforms) {
    m_out << "\t\t<Platform\n"
          << "\t\t\tName=\"" << platform << "\"\n"
          << "\t\t/>\n";
  }
  m_out << "\t</Platforms>\n";
}

void ProjectWriter::WriteConfiguration(const ProjectConfig& config) {
  m_out << "\t\t<Configuration\n"
        << "\t\t\tName=\"" << ConfigSpec(config) << "\"\n";
  WriteAttributes(3, config.generalOptions);
  if (!config.generalOptions.contains("ConfigurationType")) {
    WriteAttribute(3, "ConfigurationType", ConfigurationType(m_project.targetType));
  }
  if (!config.generalOptions.contains("ManagedExtensions")) {
    auto managed = config.compilerOptions.find("ManagedExtensions");
    WriteAttribute(3, "ManagedExtensions", managed == config.compilerOptions.end() ? "0" : managed->second);
  }
  m_out << "\t\t\t>\n";
  WriteEvent(config.preBuildEvent, "VCPreBuildEventTool");
  WriteEvent(config.preLinkEvent, "VCPreLinkEventTool");
  WriteEvent(config.postBuildEvent, "VCPostBuildEventTool");
  if (m_project.targetType != TargetType::UtilityProject) {
    OptionMap compilerOptions = config.compilerOptions;
    compilerOptions.erase("UsePrecompiledHeader");  // stands at each source
    compilerOptions.erase("ManagedExtensions");
    WriteTool("VCCLCompilerTool", compilerOptions, config);
    WriteTool("VCResourceCompilerTool", config.resourceOptions, config);
    const bool isArchive = m_project.targetType == TargetType::StaticLibrary;
    WriteTool(isArchive ? "VCLibrarianTool" : "VCLinkerTool", LinkerOptions(m_project, config), config);
  }
  m_out << "\t\t</Configuration>\n";
}

void ProjectWriter::WriteEvent(const BuildEvent& event, std::string_view tool) {
  if (!event.present) return;
  m_out << "\t\t\t<Tool\n"
        << "\t\t\t\tName=\"" << tool << "\"\n"
        << "\t\t\t\tDescription=\"" << event.description << "\"\n"
        << "\t\t\t\tCommandLine=\"" << event.commandLine << "\"\n"
        << "\t\t\t/>\n";
}

void ProjectWriter::WriteTool(std::string_view tool, const OptionMap& options, const ProjectConfig& config) {
  m_out << "\t\t\t<Tool\n"
        << "\t\t\t\tName=\"" << tool << "\"\n";
  for (const auto& [property, value] : options) {
    const bool isIncludes = property == "AdditionalIncludeDirectories";
    WriteAttribute(4, property, isIncludes ? IncludeList(m_project, config, value, m_form) : value);
  }
  m_out << "\t\t\t/>\n";
}

// --- Files

void ProjectWriter::WriteFolder(const ProjectFolder& folder, int depth) {
  for (const auto& subfolder : folder.subfolders) {
    m_out << Tabs(depth) << "<Filter\n"
          << Tabs(depth) << "\tName=\"" << subfolder->name << "\"\n"
          << Tabs(depth) << "\t>\n";
    if (HoldsProjectFile(m_project, folder, *subfolder, m_form)) {
      OpenFile(ProjectFileEntry(m_project, m_filesBase), depth + 1);
      m_out << Tabs(depth + 1) << "</File>\n";
    }
    WriteFolder(*subfolder, depth + 1);
    m_out << Tabs(depth) << "</Filter>\n";
  }
  for (const ProjectFile* file : folder.files) {
    if (!IsLeftOut(m_project, *file)) WriteFile(*file, depth);
  }
}

void ProjectWriter::WriteFile(const ProjectFile& file, int depth) {
  OpenFile(PathJoin(m_filesBase, file.path), depth);
  if (file.kind == FileKind::C || file.kind == FileKind::Cpp || file.kind == FileKind::Rc ||
      file.kind == FileKind::Asm) {
    for (const auto& config : m_project.configs) WriteFileConfiguration(file, *config, depth + 1);
  }
  m_out << Tabs(depth) << "</File>\n";
}

void ProjectWriter::WriteFileConfiguration(const ProjectFile& file, const ProjectConfig& config, int depth) {
  const FileConfigRecord* record = file.FindRecord(config);
  m_out << Tabs(depth) << "<FileConfiguration\n" << Tabs(depth) << "\tName=\"" << ConfigSpec(config) << "\"\n";
  if (file.excluded || (record && record->excluded)) m_out << Tabs(depth) << "\tExcludedFromBuild=\"true\"\n";
  m_out << Tabs(depth) << "\t>\n" << Tabs(depth) << "\t<Tool\n";
  if (file.kind == FileKind::Rc) {
    WriteAttribute(depth + 2, "Name", "VCResourceCompilerTool");
  } else if (file.kind == FileKind::Asm) {
    WriteAssemblerTool(config, depth + 2);
  } else {
    WriteAttribute(depth + 2, "Name", "VCCLCompilerTool");
    OptionMap options = record ? record->options : OptionMap();
    auto inherited = config.compilerOptions.find("UsePrecompiledHeader");
    if (inherited != config.compilerOptions.end()) options.insert(*inherited);
    WriteAttributes(depth + 2, options);
  }
  m_out << Tabs(depth) << "\t/>\n" << Tabs(depth) << "</FileConfiguration>\n";
}

void ProjectWriter::WriteAssemblerTool(const ProjectConfig& config, int depth) {
  const std::string object =
      R"(&quot;$(ProjectDir)$(PlatformName)\$(ConfigurationName)\$(ProjectName)\$(InputName).obj&quot;)";
  const bool isWin64 = config.platform == "Win64";
  WriteAttribute(depth, "Name", "VCCustomBuildTool");
  WriteAttribute(depth, "CommandLine",
                 std::string("&quot;$(VCInstallDir)bin") + (isWin64 ? R"(\x86_amd64\ml64)" : R"(\ml)") +
                     "&quot; /c /Cx" + (isWin64 ? " /D _M_X64" : " /coff") + " /Fo " + object +
                     " &quot;$(InputPath)&quot;");
  WriteAttribute(depth, "Outputs", object);
}

void ProjectWriter::OpenFile(const std::string& path, int depth) {
  m_out << Tabs(depth) << "<File\n"
        << Tabs(depth) << "\tRelativePath=\"" << Backslashed(path) << "\"\n"
        << Tabs(depth) << "\t>\n";
}

// --- Attributes

void ProjectWriter::WriteAttribute(int depth, std::string_view name, std::string_view value) {
  m_out << Tabs(depth) << name << "=\"" << value << "\"\n";
}

void ProjectWriter::WriteAttributes(int depth, const OptionMap& options) {
  for (const auto& [property, value] : options) WriteAttribute(depth, property, value);
}

}  // namespace

void WriteVc8Project(TextWriter& out, Project& project, Form form) { ProjectWriter(out, project, form).Write(); }

}  // namespace qrex
