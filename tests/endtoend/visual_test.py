#!/usr/bin/env python3
"""Builds with the command lines of the Visual C++ family, which drop-in tools carry out: clang's cl mode, lld-link and
llvm's librarian, assembler, resource compiler and manifest tool, under the names that a build calls."""

import glob
import os
import shutil

from workspace_fixture import Skipped, equal, holds, in_workspace, lacks, project, run_tests, workspace_of


def tool(name):
    """The path of a tool of the compiler suite, which may be installed under a versioned name only."""
    found = [shutil.which(name)] + sorted(glob.glob(f"/usr/lib/llvm-*/bin/{name}") + glob.glob(f"/usr/bin/{name}-*"))
    found = [path for path in found if path]
    if not found:
        raise Skipped(name)
    return found[0]


def tools():
    """The wrappers, by their names. The assembler and the manifest tool take no response file and fewer switches."""
    clang = tool("clang")
    scripts = {
        "cl": f'exec {clang} --driver-mode=cl --target=x86_64-pc-windows-msvc -Xclang -fno-show-column '
              '"$@" 2>&1',
        "link.exe": f'exec {tool("lld-link")} "$@" 2>&1',
        "lib.exe": f'exec {tool("llvm-lib")} "$@" 2>&1',
        "ml64": f"""for argument; do case $argument in @*) text=$(cat "${{argument#@}}");; esac; done
folder=${{text#*/Fo\\"}}; folder=${{folder%%\\"*}}
input=${{text##* \\"}}; input=${{input%\\"}}; stem=${{input##*/}}
exec {tool("llvm-ml")} -m64 /c /Fo "$folder${{stem%.*}}.obj" "$input" 2>&1""",
        "rc.exe": f'PATH=$PATH:{os.path.dirname(clang)} exec {tool("llvm-rc")} "$@"',
        "mt.exe": f"""text=$(cat "${{1#@}}")
target=${{text#*:\\"}}; target=${{target%%\\"*}}
manifest=${{text##* \\"}}; manifest=${{manifest%%\\"*}}
[ -f "$target" ] && exec {tool("llvm-mt")} /manifest "$manifest" /out:"$target.manifest" """,
    }
    return {f"tools/{name}": f"#!/bin/bash\n{script}\n" for name, script in scripts.items()}


def described(kind, name, target, files, link="", more=""):
    """A project; what it makes is named by its switches."""
    switches = f'+cpp {{ /nologo /W3 /GS- /Zl /D "LEVEL=7" }}\n+link {{ /OUT:"$(EXPORT_LIB)/$(PLATFORM)/$(CONFIG)/{target}" {link} }}\n{more}'
    return project(kind, name, files, switches).replace("x64", "Win64")


def manifest(name):
    return f'/MANIFEST /MANIFESTFILE:"$(PLATFORM)/$(CONFIG)/{name.partition(".")[0]}/{name}.intermediate.manifest"'


FILES = {
    **workspace_of("app", settings="""compiler = vc14 systemName = "Windows" platform = "Win64"
PATH("Win64") = { "tools" "/usr/bin" "/bin" } INCLUDE("Win64") = { "inc" } LIB("Win64") = { "lib" }
"""),
    "tree/base/src/base.qrpj": described("Static Library", "base", "$(PROJNAME).$(TGT_EXTENSION)", '"level.h" "src" { "StdAfx.h" '
                                         '"StdAfx.cpp" : +cpp { /Yc } , +cpp { /O2 } "level.cpp" "base.cpp" "twice.asm" }'),
    "tree/base/level.h": "@def offset = { 35 }\n\nint Level(int start);\ninline int Offset() { return offset; }\n",
    "tree/base/src/StdAfx.h": "@import \"base/level.h\"\n",
    "tree/base/src/StdAfx.cpp": '@import "StdAfx.h"\n',
    "tree/base/src/level.cpp": '@import "StdAfx.h"\nint Level(int start)\n{\n    return start + LEVEL;\n}\n',
    "tree/base/src/base.cpp": '@import "StdAfx.h"\n',
    "tree/base/src/twice.asm": ".code\nTwice PROC\n    lea rax, [rcx+rcx]\n    ret\nTwice ENDP\nEND\n",
    "tree/shape/src/shape.qrpj": described(
        "Dynamic-Link Library", "shape", "shape.dll", '"shape.h" "src" { "StdAfx.h" "StdAfx.cpp" : +cpp { /Yc } "shape.cpp" "shape.rc" }',
        f'/DLL /NOENTRY /NODEFAULTLIB /IMPLIB:"$(EXPORT_LIB)/$(PLATFORM)/$(CONFIG)/shape.lib" {manifest("shape.dll")}'),
    "tree/shape/shape.h": "#ifdef SHAPE\n#define API __declspec(dllexport)\n#else\n#define API __declspec(dllimport)\n#endif\n"
                          "API int Area(int a, int b);\n",
    "tree/shape/src/StdAfx.h": '#define SHAPE\n@import "shape/shape.h"\n',
    "tree/shape/src/StdAfx.cpp": '@import "StdAfx.h"\n',
    "tree/shape/src/shape.cpp": '@import "StdAfx.h"\nint Area(int a, int b)\n{\n    return a * b;\n}\n',
    "tree/shape/src/shape.rc": "1 VERSIONINFO\nFILEVERSION 1,2,3,4\nBEGIN\nEND\n",
    "tree/app/src/app.qrpj": described("Console Application", "app", "app.exe", '"src" { "StdAfx.h" "StdAfx.cpp" : +cpp { /Yc } "app.cpp" }',
                                       f'/ENTRY:Start /SUBSYSTEM:CONSOLE /NODEFAULTLIB {manifest("app.exe")}', 'subproj { "base" "shape" }'),
    "tree/app/src/StdAfx.h": '@import "base/level.h"\n@import "shape/shape.h"\n',
    "tree/app/src/StdAfx.cpp": '@import "StdAfx.h"\n',
    "tree/app/src/app.cpp": """@import "StdAfx.h"
extern "C" int Twice(int);
extern "C" int Start()
{
    return Level(Offset()) == 42 && Area(6, 7) == Twice(21) ? 0 : 1;
}
""",
}
OBJECTS = "Win64/**/*.obj"
TARGETS = "out/lib/Win64/Debug/*"


def all_files():
    return {**tools(), **FILES}


def image(workspace, name):
    """What a reader of PE files tells of a target."""
    return workspace.shell(f"{tool('llvm-readobj')} --file-headers --sections out/lib/Win64/Debug/{name}")


@in_workspace(all_files)
def test_libraries_and_a_program(workspace):
    output = workspace.run("all.qrex")
    holds(output, "- base  [Debug|Win64]", "Linking...\n", "- shape  [", "Compiling resource file shape/src/shape.rc\n",
          "Linking...\n", "- app  [", "Linking...\n", "\nCompleted....")
    equal(workspace.path("out/lib/Win64/Debug/base.lib").read_bytes()[:8], b"!<arch>\n")
    holds(image(workspace, "shape.dll"), "IMAGE_FILE_MACHINE_AMD64", "IMAGE_FILE_DLL", "Name: .rsrc")
    program = image(workspace, "app.exe")
    holds(program, "IMAGE_FILE_MACHINE_AMD64", "IMAGE_SUBSYSTEM_WINDOWS_CUI")
    lacks(program, "IMAGE_FILE_DLL")
    for project in ("app", "shape"):
        holds(workspace.path(f"Win64/Debug/{project}/mt.dep").read_text(), "Manifest resource last updated at ")
    equal([str(path) for path in workspace.folder.glob("**/*.rsp")], [])

    before = workspace.times("Win64/**/*"), workspace.times(TARGETS)
    lacks(workspace.run("all.qrex"), "Linking...")
    equal((workspace.times("Win64/**/*"), workspace.times(TARGETS)), before)

    workspace.append("tree/shape/shape.h", "int More();\n")
    workspace.run("all.qrex")
    equal(workspace.changed(before[0], OBJECTS), ["Win64/Debug/app/StdAfx.obj", "Win64/Debug/app/app.obj",
                                                  "Win64/Debug/shape/StdAfx.obj", "Win64/Debug/shape/shape.obj"])


@in_workspace(all_files)
def test_messages_are_counted_and_point_at_the_source(workspace):
    workspace.append("tree/base/src/base.cpp", "\nint Narrow()\n{\n    int unset;\n    return unset;\n}\n")
    workspace.append("tree/base/src/level.cpp", "int Broken()\n{\n    return nowhere;\n}\n")
    workspace.append("tree/app/src/app.cpp", "int wrong = nowhere;\n")
    workspace.replace("tree/base/src/base.qrpj", "/W3", "/W4")
    output = workspace.run("all.qrex")
    holds(output, "- base  [",
          "tree/base/src/level.cpp(8) ...\nqrexsource/Win64/Debug/base/src/level.cpp(",
          "): error: use of undeclared identifier 'nowhere'\n",
          "tree/base/src/base.cpp(6) ...\nqrexsource/Win64/Debug/base/src/base.cpp(", "): warning: ",
          "- app  [", "tree/app/src/app.cpp(7) ...\n", "): error: ", "\nCompleted with 1 warnings, 2 errors.")
    equal(sorted(name for name in workspace.times(TARGETS) if not name.endswith(".manifest")),
          ["out/lib/Win64/Debug/shape.dll", "out/lib/Win64/Debug/shape.lib"])
    workspace.replace("tree/base/src/level.cpp", "nowhere", "0")
    workspace.replace("tree/app/src/app.cpp", "nowhere", "0")
    holds(workspace.run("all.qrex"), "- base  [", "Linking...", "- app  [", "Linking...", "\nCompleted....")


run_tests(globals())
