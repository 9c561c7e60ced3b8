#include "generators/vc6_project.h"

#include "builder/build_paths.h"
#include "generators/common.h"
#include "text/paths.h"
#include "translator/emit/write.h"

namespace qrex {

namespace {

std::string_view TargetId(TargetType type) {
  static constexpr std::string_view kIds[] = {"0x0101", "0x0102", "0x0103", "0x0104", "0x010a"};
  return kIds[static_cast<size_t>(type)];
}

class ProjectWriter {
 public:
  ProjectWriter(TextWriter& out, const Project& project, Form form)
      : m_out(out), m_project(project), m_name(project.name), m_form(form) {}
  void WriteAll();

 private:
  void WriteHeader();
  void WriteConfig(const ProjectConfig& config);
  void WriteLinker(const ProjectConfig& config);
  void WriteTarget();
  void WriteFolder(const ProjectFolder& folder, const std::string& prefix);
  void WriteFile(const ProjectFile& file, const std::string& prefix);
  void WriteFileChanges(bool excluded, std::string_view added, std::string_view removed);
  void WriteBranch(bool isFirst, const ProjectConfig& config);
  std::string ConfigName(const ProjectConfig& config) const { return m_name + " - Win32 " + config.name; }

  TextWriter& m_out;
  const Project& m_project;
  const std::string& m_name;
  const Form m_form;
};

void ProjectWriter::WriteAll() {
  auto writeConfigs = [this] {
    for (const auto& config : m_project.configs) {
      m_out << "\n";
      WriteBranch(config == m_project.configs.front(), *config);
      m_out << "\n";
      WriteConfig(*config);
    }
  };
  WriteHeader();
  Write(m_out, R"(
    # Begin Project
    # PROP AllowPerConfigDependencies 0
    # PROP Scc_ProjName ""
    # PROP Scc_LocalPath ""
    CPP=cl.exe
    MTL=midl.exe
    RSC=rc.exe
    $configs$

    !ENDIF
    $target$
    # End Project
  )",
        "configs"_ = writeConfigs, "target"_([this] { WriteTarget(); }));
}

// The configurations Release and Debug are written whatever the project has.
void ProjectWriter::WriteHeader() {
  Write(m_out, R"(
    # Microsoft Developer Studio Project File - Name="$name$" - Package Owner=<4>
    # Microsoft Developer Studio Generated Build File, Format Version 6.00
    # ** DO NOT EDIT **

    # TARGTYPE "Win32 (x86) $type$" $id$

    CFG=$name$ - Win32 Debug
    !MESSAGE This is not a valid makefile. To build this project using NMAKE,
    !MESSAGE use the Export Makefile command and run
    !MESSAGE $nothing$
    !MESSAGE NMAKE /f "$name$.mak".
    !MESSAGE $nothing$
    !MESSAGE You can specify a configuration when running NMAKE
    !MESSAGE by defining the macro CFG on the command line. For example:
    !MESSAGE $nothing$
    !MESSAGE NMAKE /f "$name$.mak" CFG="$name$ - Win32 Debug"
    !MESSAGE $nothing$
    !MESSAGE Possible choices for configuration are:
    !MESSAGE $nothing$
    !MESSAGE "$name$ - Win32 Release" (based on "Win32 (x86) $type$")
    !MESSAGE "$name$ - Win32 Debug" (based on "Win32 (x86) $type$")
    !MESSAGE $nothing$

  )",
        "name"_ = m_name, "type"_ = TargetTypeName(m_project.targetType), "id"_ = TargetId(m_project.targetType),
        "nothing"_ = "");
}

void ProjectWriter::WriteConfig(const ProjectConfig& config) {
  const bool isDebug = config.name.find("Debug") != std::string::npos;
  const auto includes = IncludePaths(m_project, config, IsTranslatedForm(m_project, m_form));
  auto writeInclude = [this](const std::string& path) { m_out << " /I \"" << path << "\""; };
  Write(m_out, R"(
    # PROP BASE Use_MFC 0
    # PROP BASE Use_Debug_Libraries $debug$
    # PROP BASE Output_Dir "$config$"
    # PROP BASE Intermediate_Dir "$config$"
    # PROP BASE Target_Dir ""
    # PROP Use_MFC 0
    # PROP Use_Debug_Libraries $debug$
    # PROP Output_Dir "$config$/$name$"
    # PROP Intermediate_Dir "$config$/$name$"
    # PROP Ignore_Export_Lib 0
    # PROP Target_Dir ""
    # ADD CPP $compiler$$includes$
    # ADD BASE MTL /nologo /D "$define$" /mktyplib203 /win32
    # ADD MTL /nologo /D "$define$" /mktyplib203 /win32
    # ADD BASE RSC /l 0x409 /d "$define$"
    # ADD RSC /l 0x409 /d "$define$"
    BSC32=bscmake.exe
    # ADD BASE BSC32 /nologo
    # ADD BSC32 /nologo
    $linker$
  )",
        "debug"_ = int{isDebug}, "config"_ = config.name, "name"_ = m_name, "compiler"_ = config.compilerText,
        "includes"_ = Each(m_out, includes, "", writeInclude), "define"_ = isDebug ? "_DEBUG" : "NDEGUG",  // (sic)
        "linker"_([&] { WriteLinker(config); }));
}

void ProjectWriter::WriteLinker(const ProjectConfig& config) {
  if (m_project.targetType == TargetType::StaticLibrary) {
    Write(m_out, R"(
      LIB32=link.exe -lib
      # ADD BASE LIB32 /nologo
      # ADD LIB32 /nologo
    )");
  } else if (m_project.targetType != TargetType::UtilityProject) {
    Write(m_out, R"(
      LINK32=link.exe
      # ADD LINK32 $linker$
    )",
          "linker"_ = config.linkerText);
  }
}

void ProjectWriter::WriteTarget() {
  m_out << "# Begin Target\n";
  for (const auto& config : m_project.configs) m_out << "# Name \"" << ConfigName(*config) << "\"\n";
  const std::string base = IsTranslatedForm(m_project, m_form) ? "qrexsource" : m_project.rootDir;
  const std::string prefix = PathJoin(base, m_project.rootToProjDir) + "/";
  WriteFolder(m_project.rootFolder, prefix);
  if (m_form == Form::Plain) {
    Write(m_out, R"(
      # Begin Source File
      SOURCE=$prefix$$name$.qrpj
      # End Source File
    )",
          "prefix"_ = prefix, "name"_ = m_name);
  }
  m_out << "# End Target\n";
}

// Paths are those of the folder tree and the display names.
void ProjectWriter::WriteFolder(const ProjectFolder& folder, const std::string& prefix) {
  for (const auto& subfolder : folder.subfolders) {
    Write(m_out, R"(
      # Begin Group "$name$"
      # PROP Default_Filter ""
      $content$
      # End Group
    )",
          "name"_ = subfolder->name, "content"_([&] { WriteFolder(*subfolder, prefix + subfolder->name + "/"); }));
  }
  for (const ProjectFile* file : folder.files) WriteFile(*file, prefix);
}

void ProjectWriter::WriteFile(const ProjectFile& file, const std::string& prefix) {
  auto writeChanges = [&] {
    if (file.kind == FileKind::Qrpj) return;
    WriteFileChanges(file.excluded, "", "");
    for (const auto& record : file.configRecords) {
      WriteBranch(record == file.configRecords.front(), *record->config);
      WriteFileChanges(record->excluded, record->addText, record->removeText);
    }
    if (!file.configRecords.empty()) m_out << "!ENDIF\n";
  };
  Write(m_out, R"(
    # Begin Source File
    SOURCE=$prefix$$name$
    $changes$
    # End Source File
  )",
        "prefix"_ = prefix, "name"_ = file.name, "changes"_ = writeChanges);
}

void ProjectWriter::WriteFileChanges(bool excluded, std::string_view added, std::string_view removed) {
  if (excluded) m_out << "# PROP Exclude_From_Build 1\n";
  if (!added.empty()) m_out << "# ADD CPP " << added << "\n";
  if (!removed.empty()) m_out << "# SUBTRACT CPP " << removed << "\n";
}

void ProjectWriter::WriteBranch(bool isFirst, const ProjectConfig& config) {
  m_out << (isFirst ? "!IF" : "!ELSEIF") << "  \"$(CFG)\" == \"" << ConfigName(config) << "\"\n";
}

}  // namespace

void WriteVc6Project(TextWriter& out, Project& project, Form form) { ProjectWriter(out, project, form).WriteAll(); }

namespace {

void WriteDependencies(TextWriter& out, const Project& project) {
  for (const std::string& path : project.subprojects) {
    const Project* dependency = FindDependency(project, path);
    if (!dependency) continue;
    Write(out, R"(
      Begin Project Dependency
      Project_Dep_Name $name$
      End Project Dependency
    )",
          "name"_ = dependency->name);
  }
}

}  // namespace

void WriteVc6Workspace(TextWriter& out, const Workspace& workspace, Form form) {
  out << "Microsoft Developer Studio Workspace File, Format Version 6.00\n"
         "# WARNING: DO NOT EDIT OR DELETE THIS WORKSPACE FILE!\n\n";
  for (const auto& project : workspace.projects) {
    Write(out, R"(
      ###############################################################################

      Project: "$name$"=./$prefix$$name$.dsp - Package Owner=<4>

      Package=<5>
      {{{
      }}}

      Package=<4>
      {{{
          $dependencies$
      }}}

    )",
          "name"_ = project->name, "prefix"_ = NamePrefix(FormOf(*project, form)),
          "dependencies"_([&] { WriteDependencies(out, *project); }));
  }
}

}  // namespace qrex
