#include "generators/vc6_project.h"

#include "build/tools.h"
#include "generators/common.h"
#include "text/paths.h"

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
  void Write();

 private:
  void WriteHeader();
  void WriteConfig(const ProjectConfig& config);
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

void ProjectWriter::Write() {
  WriteHeader();
  m_out << "# Begin Project\n"
           "# PROP AllowPerConfigDependencies 0\n"
           "# PROP Scc_ProjName \"\"\n"
           "# PROP Scc_LocalPath \"\"\n"
           "CPP=cl.exe\n"
           "MTL=midl.exe\n"
           "RSC=rc.exe\n";
  for (const auto& config : m_project.configs) {
    m_out << "\n";
    WriteBranch(config == m_project.configs.front(), *config);
    m_out << "\n";
    WriteConfig(*config);
  }
  m_out << "\n!ENDIF\n";
  WriteTarget();
  m_out << "# End Project\n";
}

// The configurations Release and Debug stand here whatever the project has.
void ProjectWriter::WriteHeader() {
  const std::string_view type = TargetTypeName(m_project.targetType);
  m_out << "# Microsoft Developer Studio Project File - Name=\"" << m_name << "\" - Package Owner=<4>\n"
        << "# Microsoft Developer Studio Generated Build File, Format Version 6.00\n"
        << "# ** DO NOT EDIT **\n"
        << "\n"
        << "# TARGTYPE \"Win32 (x86) " << type << "\" " << TargetId(m_project.targetType) << "\n"
        << "\n"
        << "CFG=" << m_name << " - Win32 Debug\n"
        << "!MESSAGE This is not a valid makefile. To build this project using NMAKE,\n"
        << "!MESSAGE use the Export Makefile command and run\n"
        << "!MESSAGE \n"
        << "!MESSAGE NMAKE /f \"" << m_name << ".mak\".\n"
        << "!MESSAGE \n"
        << "!MESSAGE You can specify a configuration when running NMAKE\n"
        << "!MESSAGE by defining the macro CFG on the command line. For example:\n"
        << "!MESSAGE \n"
        << "!MESSAGE NMAKE /f \"" << m_name << ".mak\" CFG=\"" << m_name << " - Win32 Debug\"\n"
        << "!MESSAGE \n"
        << "!MESSAGE Possible choices for configuration are:\n"
        << "!MESSAGE \n"
        << "!MESSAGE \"" << m_name << " - Win32 Release\" (based on \"Win32 (x86) " << type << "\")\n"
        << "!MESSAGE \"" << m_name << " - Win32 Debug\" (based on \"Win32 (x86) " << type << "\")\n"
        << "!MESSAGE \n"
        << "\n";
}

void ProjectWriter::WriteConfig(const ProjectConfig& config) {
  const bool isDebug = config.name.find("Debug") != std::string::npos;
  const std::string_view define = isDebug ? "_DEBUG" : "NDEGUG";  // (sic)
  m_out << "# PROP BASE Use_MFC 0\n"
        << "# PROP BASE Use_Debug_Libraries " << int{isDebug} << "\n"
        << "# PROP BASE Output_Dir \"" << config.name << "\"\n"
        << "# PROP BASE Intermediate_Dir \"" << config.name << "\"\n"
        << "# PROP BASE Target_Dir \"\"\n"
        << "# PROP Use_MFC 0\n"
        << "# PROP Use_Debug_Libraries " << int{isDebug} << "\n"
        << "# PROP Output_Dir \"" << config.name << "/" << m_name << "\"\n"
        << "# PROP Intermediate_Dir \"" << config.name << "/" << m_name << "\"\n"
        << "# PROP Ignore_Export_Lib 0\n"
        << "# PROP Target_Dir \"\"\n"
        << "# ADD CPP " << config.compilerText;
  for (const std::string& path : IncludePaths(m_project, config, IsTranslatedForm(m_project, m_form))) {
    m_out << " /I \"" << path << "\"";
  }
  m_out << "\n"
        << "# ADD BASE MTL /nologo /D \"" << define << "\" /mktyplib203 /win32\n"
        << "# ADD MTL /nologo /D \"" << define << "\" /mktyplib203 /win32\n"
        << "# ADD BASE RSC /l 0x409 /d \"" << define << "\"\n"
        << "# ADD RSC /l 0x409 /d \"" << define << "\"\n"
        << "BSC32=bscmake.exe\n"
        << "# ADD BASE BSC32 /nologo\n"
        << "# ADD BSC32 /nologo\n";
  if (m_project.targetType == TargetType::StaticLibrary) {
    m_out << "LIB32=link.exe -lib\n"
          << "# ADD BASE LIB32 /nologo\n"
          << "# ADD LIB32 /nologo\n";
  } else if (m_project.targetType != TargetType::UtilityProject) {
    m_out << "LINK32=link.exe\n"
          << "# ADD LINK32 " << config.linkerText << "\n";
  }
}

void ProjectWriter::WriteTarget() {
  m_out << "# Begin Target\n";
  for (const auto& config : m_project.configs) m_out << "# Name \"" << ConfigName(*config) << "\"\n";
  const std::string base = IsTranslatedForm(m_project, m_form) ? "qrexsource" : m_project.rootDir;
  const std::string prefix = PathJoin(base, m_project.rootToProjDir) + "/";
  WriteFolder(m_project.rootFolder, prefix);
  if (m_form == Form::Plain) {
    m_out << "# Begin Source File\n"
          << "SOURCE=" << prefix << m_name << ".qrpj\n"
          << "# End Source File\n";
  }
  m_out << "# End Target\n";
}

// Paths are those of the folder tree and the display names.
void ProjectWriter::WriteFolder(const ProjectFolder& folder, const std::string& prefix) {
  for (const auto& subfolder : folder.subfolders) {
    m_out << "# Begin Group \"" << subfolder->name << "\"\n"
          << "# PROP Default_Filter \"\"\n";
    WriteFolder(*subfolder, prefix + subfolder->name + "/");
    m_out << "# End Group\n";
  }
  for (const ProjectFile* file : folder.files) WriteFile(*file, prefix);
}

void ProjectWriter::WriteFile(const ProjectFile& file, const std::string& prefix) {
  m_out << "# Begin Source File\n"
        << "SOURCE=" << prefix << file.name << "\n";
  if (file.kind != FileKind::Qrpj) {
    WriteFileChanges(file.excluded, "", "");
    for (const auto& record : file.configRecords) {
      WriteBranch(record == file.configRecords.front(), *record->config);
      WriteFileChanges(record->excluded, record->addText, record->removeText);
    }
    if (!file.configRecords.empty()) m_out << "!ENDIF\n";
  }
  m_out << "# End Source File\n";
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

void WriteVc6Project(TextWriter& out, Project& project, Form form) { ProjectWriter(out, project, form).Write(); }

void WriteVc6Workspace(TextWriter& out, const Workspace& workspace, Form form) {
  out << "Microsoft Developer Studio Workspace File, Format Version 6.00\n"
      << "# WARNING: DO NOT EDIT OR DELETE THIS WORKSPACE FILE!\n"
      << "\n";
  for (const auto& project : workspace.projects) {
    const std::string_view prefix = NamePrefix(FormOf(*project, form));
    out << std::string(79, '#') << "\n"
        << "\n"
        << "Project: \"" << project->name << "\"=./" << prefix << project->name << ".dsp - Package Owner=<4>\n"
        << "\n"
        << "Package=<5>\n"
        << "{{{\n"
        << "}}}\n"
        << "\n"
        << "Package=<4>\n"
        << "{{{\n";
    for (const std::string& path : project->subprojects) {
      const Project* dependency = FindDependency(*project, path);
      if (!dependency) continue;
      out << "    Begin Project Dependency\n"
          << "    Project_Dep_Name " << dependency->name << "\n"
          << "    End Project Dependency\n";
    }
    out << "}}}\n"
        << "\n";
  }
}

}  // namespace qrex
