#include "generators/exported_project.h"

#include "text/files.h"
#include "text/output_policy.h"
#include "text/paths.h"
#include "workspace/workspace.h"

namespace qrex {

namespace {

void WriteFolder(TextWriter& out, const ProjectFolder& folder, bool isRoot) {
  out << "{\n";
  {
    IndentScope indent(out, 4);
    for (const auto& subfolder : folder.subfolders) {
      if (isRoot && subfolder->name == "src") continue;
      out << "\"" << subfolder->name << "\"\n";
      WriteFolder(out, *subfolder, false);
    }
    for (const ProjectFile* file : folder.files) {
      if (!file->excluded) out << "\"" << file->name << "\"\n";
    }
  }
  out << "}\n";
}

void WriteConfigs(TextWriter& out, const Project& project) {
  out << "config\n{\n";
  {
    IndentScope indent(out, 4);
    for (const auto& config : project.configs) {
      out << "\"" << config->name << "|" << config->platform << "\"";
      for (size_t i = 0; i < config->tags.size(); ++i) out << (i == 0 ? " [\"" : " \"") << config->tags[i] << "\"";
      out << (config->tags.empty() ? "\n" : "]\n");
    }
  }
  out << "}\n\n";
}

void WriteSubprojects(TextWriter& out, const Project& project) {
  out << "subproj\n{\n";
  {
    IndentScope indent(out, 4);
    for (const std::string& path : project.subprojects) {
      const Project* subproject = project.workspace->FindSubproject(path);
      if (subproject) out << "\"" << subproject->rootToProjDir << "\"\n";
    }
  }
  out << "}\n\n";
}

}  // namespace

void WriteExportedProject(Project& project) {
  MemoryTextWriter out;
  out << "$TARGET_TYPE = \"" << TargetTypeName(project.targetType) << "\"\n";
  out << "$ROOT_TO_PROJDIR = \"" << project.rootToProjDir << "\"\n";
  out << "export\n";
  if (project.usesQrex) out << "qrex\n";
  out << "\n";
  WriteConfigs(out, project);
  WriteSubprojects(out, project);
  if (project.targetType == TargetType::UtilityProject) {
    out << "\n";
  } else {
    out << "+link\n{\n    /OUT:\"$(EXPORT_LIB)/$(CONFIG)/$(PROJNAME).$(TGT_EXTENSION)\"\n}\n\n";
  }
  WriteFolder(out, project.rootFolder, true);

  const std::string path =
      PathJoin3(project.settings->exportUntranslatedInclude, project.sourceDir, project.name + ".qrpj");
  CreateDirectories(path, false);
  UpdateFile(project.settings->leftovers, out, path, ReadOnlyTarget::Replace);
  ChangeReadOnly(path, true);
}

}  // namespace qrex
