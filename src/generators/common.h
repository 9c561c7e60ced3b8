// What the writers of project files share: names and paths of the two forms of a project, dependencies, walks of
// folders.
//
// A project that passes through the translator has two forms. The plain one lists the sources; the one with the name
// prefix "build_" lists their translated copies. Writers fill a TextWriter with line feeds alone and never touch the
// disk; generate.cpp hands the text to UpdateFile.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "generators/form.h"
#include "text/text_writer.h"
#include "workspace/workspace.h"

namespace qrex {

bool AnyProjectUsesQrex(const Workspace& workspace);

// True when this form of the project lists translated files.
inline bool IsTranslatedForm(const Project& project, Form form) { return form == Form::Translated && project.usesQrex; }
inline Form FormOf(const Project& project, Form form) {
  return IsTranslatedForm(project, form) ? Form::Translated : Form::Plain;
}
inline std::string_view NamePrefix(Form form) { return form == Form::Translated ? "build_" : ""; }

// The text between the last `/` and the last `.` of a subproject's path; empty when there is none.
std::string SubprojectName(std::string_view path);

// The project behind an entry of `subprojects`. Null, with an "Error : Can't find dependent project " line, when the
// workspace does not hold it.
const Project* FindDependency(const Project& project, const std::string& path);

// Whether a file is left out of a project: resources of a library that is linked statically.
inline bool IsLeftOut(const Project& project, const ProjectFile& file) {
  return file.kind == FileKind::Rc && project.libraryIsStatic;
}

// The folder in which the unprefixed form lists the project file itself: "src" under the root.
bool HoldsProjectFile(const Project& project, const ProjectFolder& parent, const ProjectFolder& folder, Form form);
std::string ProjectFileEntry(const Project& project, std::string_view base);  // base/sourceDir/name.qrpj

}  // namespace qrex
