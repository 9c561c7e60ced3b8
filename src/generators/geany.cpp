#include "generators/geany.h"

#include "translator/emit/write.h"

namespace qrex {

namespace {

constexpr std::string_view kBuildDirectory = "/home/qdev/developer/build_gcc/build";
constexpr std::string_view kSourceRoot = "/home/qdev/developer/_root_";

}  // namespace

void WriteGeanyProject(TextWriter& out, const Workspace& workspace) {
  auto writeFiles = [&] {
    size_t count = 0;
    for (const ProjectFile* file : workspace.projects.front()->files) {
      if (file->kind != FileKind::C && file->kind != FileKind::Cpp) continue;
      Write(out, "FILE_NAME_$number$=0;C++;0;16;0;1;0;$root$/$path$;0;4\n", "number"_ = count++, "root"_ = kSourceRoot,
            "path"_ = file->path);
    }
  };
  Write(out, R"(
    [indentation]
    indent_width=4
    indent_type=0
    indent_hard_tab_width=8
    detect_indent=false
    detect_indent_width=false
    indent_mode=2

    [project]
    name=$name$
    base_path=$directory$
    description=
    file_patterns=

    [long line marker]
    long_line_behaviour=1
    long_line_column=72

    [files]
    current_page=0
    $files$

    [build-menu]
    NF_00_LB=_Make
    NF_00_CM=make
    NF_00_WD=$directory$
  )",
        "name"_ = workspace.name, "directory"_ = kBuildDirectory, "files"_ = writeFiles);
}

}  // namespace qrex
