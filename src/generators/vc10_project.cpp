#include "generators/vc10_project.h"

#include <algorithm>
#include <span>
#include <vector>

#include "generators/common.h"
#include "generators/vs_common.h"
#include "generators/xml.h"
#include "text/numbers.h"
#include "text/paths.h"
#include "workspace/switch_tables.h"

namespace qrex {

namespace {

constexpr std::string_view kHead = "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n";
constexpr std::string_view kNameSpace = "http://schemas.microsoft.com/developer/msbuild/2003";

// Names that differ between the option maps and this format.
constexpr SwitchProperty kCompilerElements[] = {
    {"FunctionLevelLinking", "EnableFunctionLevelLinking"},
    {"IntrinsicFunctions", "EnableIntrinsicFunctions"},
    {"PreprocessKeepComments", "KeepComments"},
    {"OpenMPSupport", "OpenMP"},
    {"TreatWarningAsError", "WarnAsError"},
    {"ObjectFileName", "ObjectFile"},
    {"PrecompiledHeaderOutputFile", "PrecompiledHeaderFile"},
};
constexpr SwitchProperty kLinkerElements[] = {
    {"NoEntryPoint", "ResourceOnlyDLL"},
    {"LinkErrorReporting", "ErrorReporting"},
};

// General options whose values are indices.
struct EnumeratedOption {
  std::string_view property;
  std::string_view element;
  std::span<const std::string_view> names;
};
constexpr std::string_view kCharacterSets[] = {"NotSet", "Unicode", "MultiByte"};
constexpr std::string_view kLibraryUses[] = {"false", "Static", "Dynamic"};
constexpr std::string_view kWholeProgramModes[] = {"false", "true", "PGInstrument", "PGOptimize", "PGUpdate"};
constexpr std::string_view kManagedModes[] = {"false", "true", "Pure", "Safe", "OldSyntax"};
constexpr std::string_view kIncrementalModes[] = {"-", "false", "true"};
constexpr EnumeratedOption kConfigurationOptions[] = {
    {"CharacterSet", "CharacterSet", kCharacterSets},
    {"UseOfATL", "UseOfAtl", kLibraryUses},
    {"UseOfMFC", "UseOfMfc", kLibraryUses},
    {"WholeProgramOptimization", "WholeProgramOptimization", kWholeProgramModes},
};
constexpr EnumeratedOption kManagedOption = {"ManagedExtensions", "CLRSupport", kManagedModes};
constexpr EnumeratedOption kIncrementalOption = {"LinkIncremental", "LinkIncremental", kIncrementalModes};

std::string_view ElementName(std::span<const SwitchProperty> elements, std::string_view property) {
  const SwitchProperty* row = FindProperty(elements, property);
  return row ? row->name : property;
}

std::string_view ConfigurationType(TargetType type) {
  static constexpr std::string_view kNames[] = {"Application", "StaticLibrary", "Application", "DynamicLibrary",
                                                "Utility"};
  return kNames[static_cast<size_t>(type)];
}

// Empty for the one compiler that has no name for its own.
std::string Toolset(const Project& project, const ProjectConfig& config) {
  if (!config.platformToolset.empty()) return config.platformToolset;
  const ConfigSettings& settings = *project.settings;
  if (!settings.platformToolset.empty()) return settings.platformToolset;
  const std::string toolset(CompilerOf(settings.compiler).toolset);
  return toolset.empty() || !settings.targetXP ? toolset : toolset + "_xp";
}

std::string_view ItemName(const ProjectFile& file) {
  if (file.excluded) return "None";
  switch (file.kind) {
    case FileKind::C:
    case FileKind::Cpp:
      return "ClCompile";
    case FileKind::H:
      return "ClInclude";
    case FileKind::Rc:
      return "ResourceCompile";
    case FileKind::Asm:
      return "CustomBuild";
    default:
      return "None";
  }
}

std::string TranslatedRoot(const Project& project, Form form) {
  if (!IsTranslatedForm(project, form)) return project.rootDir;
  const ConfigSettings& settings = *project.settings;
  if (settings.platform.empty()) return "qrexsource/$(Platform)/$(Configuration)";
  return "qrexsource/" + settings.platform + "/" + settings.config;
}

// --- The file tree, as both texts list it

struct Item {
  std::string path;
  std::string filter;                 // names of the folders below the root, joined by a backslash
  const ProjectFile* file = nullptr;  // null: the project file itself
};

struct ItemList {
  std::vector<std::string> filters;  // parents before their children
  std::vector<Item> items;
};

void AddItems(const Project& project, const ProjectFolder& folder, const std::string& filter, const std::string& root,
              Form form, ItemList& list) {
  for (const auto& subfolder : folder.subfolders) {
    const std::string subfilter = filter.empty() ? subfolder->name : filter + "\\" + subfolder->name;
    list.filters.push_back(subfilter);
    if (HoldsProjectFile(project, folder, *subfolder, form)) {
      list.items.push_back({ProjectFileEntry(project, root), subfilter, nullptr});
    }
    AddItems(project, *subfolder, subfilter, root, form, list);
  }
  for (const ProjectFile* file : folder.files) {
    if (!IsLeftOut(project, *file)) list.items.push_back({PathJoin(root, file->path), filter, file});
  }
}

ItemList ItemsOf(const Project& project, Form form) {
  ItemList list;
  AddItems(project, project.rootFolder, "", TranslatedRoot(project, form), form, list);
  return list;
}

// --- Writing

std::string Condition(const ProjectConfig& config) {
  return "'$(Configuration)|$(Platform)'=='" + ConfigSpec(config) + "'";
}

class ProjectWriter {
 public:
  ProjectWriter(TextWriter& out, Project& project, Form form)
      : m_xml(out, XmlLayout::Blanks), m_project(project), m_form(form) {}
  void WriteAll();

 private:
  void WriteConfigurations();
  void WriteConfigurationGroup(const ProjectConfig& config);
  void WritePropertySheets(const ProjectConfig& config);
  void WriteOutputs(const ProjectConfig& config);
  void WriteTools(const ProjectConfig& config);
  void WriteCompilerTool(const ProjectConfig& config);
  void WriteCompilerOption(const ProjectConfig& config, const std::string& property, const std::string& value);
  void WriteResourceTool(const ProjectConfig& config);
  void WriteLibrarianTool(const ProjectConfig& config);
  void WriteLinkerTool(const ProjectConfig& config);
  bool WriteLinkerOption(std::string_view property, std::string_view value);
  void WriteFiles();
  void WriteSource(const Item& item);
  void WriteAssemblerFile(const Item& item);
  void WriteReferences();
  void WriteReference(const std::string& subproject);

  // Pieces of all tools
  void WriteConditional(std::string_view element, const ProjectConfig& config, std::string_view value);
  void WriteInherited(std::string_view element, std::string_view value, std::string_view separator);
  void WriteDirectory(const OptionMap& options, const std::string& property, std::string_view element);
  bool WriteEnumerated(const OptionMap& options, const EnumeratedOption& option);
  void WriteIncludes(const ProjectConfig& config, std::string_view value);

  XmlWriter m_xml;
  Project& m_project;
  const Form m_form;
};

void ProjectWriter::WriteAll() {
  for (const auto& config : m_project.configs) config->linkerOptions = LinkerOptions(m_project, *config);
  const XmlElement project(m_xml, "Project",
                           {{"DefaultTargets", "Build"},
                            {"ToolsVersion", CompilerOf(m_project.settings->compiler).projectVersion},
                            {"xmlns", kNameSpace}});
  WriteConfigurations();
  {
    const XmlElement globals(m_xml, "PropertyGroup", {{"Label", "Globals"}});
    m_xml.Value("ProjectGuid", GuidText(m_project.guid));
    const ConfigSettings& settings = *m_project.settings;
    if (!settings.platformToolset.empty()) {  // without it, a tool set of today looks for Windows SDK 8.1
      m_xml.Value("WindowsTargetPlatformVersion", settings.windowsSdk.empty() ? "10.0" : settings.windowsSdk);
    }
  }
  m_xml.Empty("Import", {{"Project", R"($(VCTargetsPath)\Microsoft.Cpp.Default.props)"}});
  for (const auto& config : m_project.configs) WriteConfigurationGroup(*config);
  m_xml.Empty("Import", {{"Project", R"($(VCTargetsPath)\Microsoft.Cpp.props)"}});
  { const XmlElement extensions(m_xml, "ImportGroup", {{"Label", "ExtensionSettings"}}); }
  for (const auto& config : m_project.configs) WritePropertySheets(*config);
  m_xml.Empty("PropertyGroup", {{"Label", "UserMacros"}});
  {
    const XmlElement version(m_xml, "PropertyGroup");
    m_xml.Value("_ProjectFileVersion", "11.0.50727.1");
  }
  for (const auto& config : m_project.configs) WriteOutputs(*config);
  for (const auto& config : m_project.configs) WriteTools(*config);
  WriteFiles();
  WriteReferences();
  m_xml.Empty("Import", {{"Project", R"($(VCTargetsPath)\Microsoft.Cpp.targets)"}});
  const XmlElement extensions(m_xml, "ImportGroup", {{"Label", "ExtensionTargets"}});
}

void ProjectWriter::WriteConfigurations() {
  const XmlElement group(m_xml, "ItemGroup", {{"Label", "ProjectConfigurations"}});
  for (const auto& config : m_project.configs) {
    const XmlElement item(m_xml, "ProjectConfiguration", {{"Include", ConfigSpec(*config)}});
    m_xml.Value("Configuration", config->name);
    m_xml.Value("Platform", config->platform);
  }
}

void ProjectWriter::WriteConfigurationGroup(const ProjectConfig& config) {
  const XmlElement group(m_xml, "PropertyGroup", {{"Condition", Condition(config)}, {"Label", "Configuration"}});
  m_xml.Value("ConfigurationType", ConfigurationType(m_project.targetType));
  if (const std::string toolset = Toolset(m_project, config); !toolset.empty()) {
    m_xml.Value("PlatformToolset", toolset);
  }
  for (const EnumeratedOption& option : kConfigurationOptions) WriteEnumerated(config.generalOptions, option);
  if (!WriteEnumerated(config.generalOptions, kManagedOption)) WriteEnumerated(config.compilerOptions, kManagedOption);
}

void ProjectWriter::WritePropertySheets(const ProjectConfig& config) {
  const XmlElement group(m_xml, "ImportGroup", {{"Condition", Condition(config)}, {"Label", "PropertySheets"}});
  static constexpr std::string_view kSheet = R"($(UserRootDir)\Microsoft.Cpp.$(Platform).user.props)";
  m_xml.Empty(
      "Import",
      {{"Project", kSheet}, {"Condition", "exists('" + std::string(kSheet) + "')"}, {"Label", "LocalAppDataPlatform"}});
}

void ProjectWriter::WriteOutputs(const ProjectConfig& config) {
  const XmlElement group(m_xml, "PropertyGroup", {{"Condition", Condition(config)}});
  WriteDirectory(config.generalOptions, "IntermediateDirectory", "IntDir");
  WriteDirectory(config.generalOptions, "OutputDirectory", "OutDir");
  WriteEnumerated(config.linkerOptions, kIncrementalOption);
  if (auto manifest = config.linkerOptions.find("GenerateManifest"); manifest != config.linkerOptions.end()) {
    m_xml.Value("GenerateManifest", manifest->second == "0" || manifest->second == "false" ? "false" : "true");
  }
  if (m_form == Form::Translated) m_xml.Value("TargetName", m_project.name);
}

void ProjectWriter::WriteTools(const ProjectConfig& config) {
  const XmlElement group(m_xml, "ItemDefinitionGroup", {{"Condition", Condition(config)}});
  if (m_project.targetType == TargetType::UtilityProject) return;
  WriteCompilerTool(config);
  WriteResourceTool(config);
  if (m_project.targetType == TargetType::StaticLibrary) {
    WriteLibrarianTool(config);
  } else {
    WriteLinkerTool(config);
  }
}

// --- Compiler and resource compiler

void ProjectWriter::WriteCompilerTool(const ProjectConfig& config) {
  const XmlElement tool(m_xml, "ClCompile");
  for (const auto& [property, value] : config.compilerOptions) WriteCompilerOption(config, property, value);
  m_xml.Value("PrecompiledHeaderFile", "StdAfx.h");
}

// Properties that have no place in this format disappear silently.
void ProjectWriter::WriteCompilerOption(const ProjectConfig& config, const std::string& property,
                                        const std::string& value) {
  if (FindProperty(kSignedFlags, property) || FindProperty(kFlags, property)) {
    m_xml.Value(ElementName(kCompilerElements, property), value);
  } else if (FindProperty(kEnumerated, property)) {
    if (property == "ManagedExtensions") return;  // in the configuration group
    const EnumeratedSwitch* row = FindValue(kEnumerated, property, value);
    if (row && !row->valueName.empty()) m_xml.Value(property, row->valueName);
  } else if (property == "AdditionalIncludeDirectories") {
    WriteIncludes(config, value);
  } else if (property == "AdditionalOptions") {
    WriteInherited(property, value, " ");
  } else if (FindProperty(kLists, property)) {
    WriteInherited(property, value, ";");
  } else if (property == "ProgramDataBaseFileName" || property == "ObjectFile" || property == "PrecompiledHeaderFile") {
    m_xml.Value(ElementName(kCompilerElements, property), value);
  }
}

void ProjectWriter::WriteResourceTool(const ProjectConfig& config) {
  const XmlElement tool(m_xml, "ResourceCompile");
  for (const auto& [property, value] : config.resourceOptions) {
    if (property == "AdditionalIncludeDirectories") {
      WriteIncludes(config, value);
    } else if (property == "PreprocessorDefinitions") {
      WriteInherited(property, value, ";");
    } else {
      TraceWriter() << "todo : resource switch " << property << " = " << value << "\n";
    }
  }
}

// --- Librarian and linker

// The list properties and the libraries, which both tools have.
bool ProjectWriter::WriteLinkerOption(std::string_view property, std::string_view value) {
  if (FindProperty(kLinkerLists, property) || property == "AdditionalOptions") {
    m_xml.Value(property, value);
    return true;
  }
  if (property != "AdditionalDependencies") return false;
  if (!value.empty()) WriteInherited(property, value, "");
  return true;
}

void ProjectWriter::WriteLibrarianTool(const ProjectConfig& config) {
  const XmlElement tool(m_xml, "Lib");
  for (const auto& [property, value] : config.linkerOptions) {
    if (FindProperty(kLibrarianFlags, property) || FindProperty(kLibrarianValues, property)) {
      m_xml.Value(property, value);
    } else if (!WriteLinkerOption(property, value)) {
      TraceWriter() << "todo : librarian switch " << property << " = " << value << "\n";
    }
  }
}

void ProjectWriter::WriteLinkerTool(const ProjectConfig& config) {
  const XmlElement tool(m_xml, "Link");
  for (const auto& [property, value] : config.linkerOptions) {
    if (property == "LinkIncremental" || property == "GenerateManifest") continue;  // written with the outputs
    if (const EnumeratedSwitch* row = FindValue(kLinkerEnumerated, property, value)) {
      if (row->valueName.empty()) {
        TraceWriter() << "VS2012 has no mapping for linker switch " << property << " = " << value << "\n";
      } else {
        m_xml.Value(ElementName(kLinkerElements, property), row->valueName);
      }
    } else if (FindProperty(kLinkerFlags, property) || FindProperty(kLinkerValues, property) ||
               property == "MapFileName") {
      m_xml.Value(ElementName(kLinkerElements, property), value);
    } else if (!WriteLinkerOption(property, value)) {
      TraceWriter() << "todo : linker switch " << property << " = " << value << "\n";
    }
  }
}

// --- Files and references

void ProjectWriter::WriteFiles() {
  const XmlElement group(m_xml, "ItemGroup");
  for (const Item& item : ItemsOf(m_project, m_form).items) {
    const std::string_view name = item.file ? ItemName(*item.file) : "None";
    if (name == "ClCompile") {
      WriteSource(item);
    } else if (name == "CustomBuild") {
      WriteAssemblerFile(item);
    } else {
      m_xml.Empty(name, {{"Include", item.path}});
    }
  }
}

void ProjectWriter::WriteSource(const Item& item) {
  const XmlElement source(m_xml, "ClCompile", {{"Include", item.path}});
  std::string_view use = "2";
  if (!item.file->configRecords.empty()) {
    const OptionMap& options = item.file->configRecords.front()->options;
    if (auto found = options.find("UsePrecompiledHeader"); found != options.end()) use = found->second;
  }
  for (const auto& config : m_project.configs) {
    if (use == "1") {
      WriteConditional("PrecompiledHeaderFile", *config, "StdAfx.h");
      WriteConditional("PrecompiledHeader", *config, "Create");
    } else if (use == "2") {
      WriteConditional("PrecompiledHeader", *config, "Use");
    }
  }
}

void ProjectWriter::WriteAssemblerFile(const Item& item) {
  const XmlElement file(m_xml, "CustomBuild", {{"Include", item.path}});
  for (const auto& config : m_project.configs) {
    const bool isWin64 = config->platform == "Win64";
    WriteConditional(
        "Command", *config,
        std::string(R"("$(VCInstallDir)bin)") +
            (isWin64 ? R"(\x86_amd64\ml64" /c /Cx /D _M_X64)" : R"(\ml" /c /Cx /coff)") +
            R"xml( /Fo "$(ProjectDir)$(PlatformName)\$(ConfigurationName)\$(ProjectName)\%(Filename).obj" "%(FullPath)")xml");
    WriteConditional("Outputs", *config,
                     R"($(ProjectDir)$(Platform)\$(Configuration)\$(ProjectName)\%(Filename).obj;%(Outputs))");
  }
}

void ProjectWriter::WriteReferences() {
  if (m_project.subprojects.empty()) return;
  const XmlElement group(m_xml, "ItemGroup");
  for (const std::string& subproject : m_project.subprojects) WriteReference(subproject);
}

void ProjectWriter::WriteReference(const std::string& subproject) {
  const Project* dependency = FindDependency(m_project, subproject);
  if (!dependency || dependency->exported) return;
  const std::string prefix(NamePrefix(FormOf(*dependency, m_form)));
  const XmlElement reference(m_xml, "ProjectReference", {{"Include", prefix + dependency->name + ".vcxproj"}});
  m_xml.Value("Project", GuidText(dependency->guid));
  m_xml.Value("ReferenceOutputAssembly", "false");
}

// --- Pieces

void ProjectWriter::WriteConditional(std::string_view element, const ProjectConfig& config, std::string_view value) {
  m_xml.Value(element, value, {{"Condition", Condition(config)}});
}

// A value ahead of what the property sheets give.
void ProjectWriter::WriteInherited(std::string_view element, std::string_view value, std::string_view separator) {
  std::string text(value);
  text.append(separator).append("%(").append(element).append(")");
  m_xml.Value(element, text);
}

void ProjectWriter::WriteDirectory(const OptionMap& options, const std::string& property, std::string_view element) {
  if (auto found = options.find(property); found != options.end()) m_xml.Value(element, found->second + "/");
}

// True when the map holds the option, also with an index that has no name.
bool ProjectWriter::WriteEnumerated(const OptionMap& options, const EnumeratedOption& option) {
  auto found = options.find(std::string(option.property));
  if (found == options.end()) return false;
  uint64_t index;
  std::string error;
  if (ParseNumber(found->second, index, error) && index < option.names.size()) {
    m_xml.Value(option.element, option.names[index]);
  } else {
    TraceWriter() << option.property << " index = " << found->second << " out of range\n";
  }
  return true;
}

void ProjectWriter::WriteIncludes(const ProjectConfig& config, std::string_view value) {
  WriteInherited("AdditionalIncludeDirectories", IncludeList(m_project, config, value, m_form), ";");
}

}  // namespace

void WriteVc10Project(TextWriter& out, Project& project, Form form) {
  out << kHead;
  ProjectWriter(out, project, form).WriteAll();
}

void WriteVc10Filters(TextWriter& out, Project& project, Form form) {
  const ItemList list = ItemsOf(project, form);
  out << kHead;
  XmlWriter xml(out, XmlLayout::Blanks);
  const XmlElement root(xml, "Project", {{"ToolsVersion", "4.0"}, {"xmlns", kNameSpace}});
  {
    const XmlElement group(xml, "ItemGroup");
    for (const std::string& filter : list.filters) XmlElement(xml, "Filter", {{"Include", filter}});
  }
  const XmlElement group(xml, "ItemGroup");
  for (const Item& item : list.items) {
    const XmlElement element(xml, item.file ? ItemName(*item.file) : "None", {{"Include", item.path}});
    if (!item.filter.empty()) xml.Value("Filter", item.filter);
  }
}

}  // namespace qrex
