"""Workspaces of many projects and files, with the same build described for the peers."""

import os
import subprocess

from workloads import write

CONFIGURATION = """virtualTree = { "tree" }
$EXPORT_LIB = "out/lib"
$EXPORT_TRANSLATED_INCLUDE = "out/tinc"
$EXPORT_UNTRANSLATED_INCLUDE = "out/uinc"
workspaces = { "all.qrws" }
config = "Debug"
platform = "x64"
mode = %s
compiler = gcc
systemName = "Linux"
PATH("x64") = { "tools" "/usr/bin" "/bin" }
INCLUDE("x64") = { "include" }
LIB("x64") = { "lib" }
"""

PROJECT = """$TARGET_TYPE = "Static Library"
$ROOT_TO_PROJDIR = "p{number}"
config {{ "Debug|x64" }}
+cpp {{ -g -Wall }}
subproj {{ {dependency} }}
qrex
{{ "p{number}.h" "src" {{ {files} }} }}
"""


def quoted(texts, separator):
    return separator.join(f'"{text}"' for text in texts)


def workspace(root, mode, projects, files):
    """A chain of static libraries p0, p1, ..; each source imports the header of its library. Gives the source names."""
    write(f"{root}/main.qrex", CONFIGURATION % mode)
    write(f"{root}/tree/.qrwsroot", "")
    write(f"{root}/tree/all.qrws", f'"all" {{ {quoted([f"p{number}" for number in range(projects)], " ")} }}\n')
    sources = []
    for number in range(projects):
        names = [f"f{number}_{index}.cpp" for index in range(files)]
        dependency = f'"p{number - 1}"' if number else ""
        write(f"{root}/tree/p{number}/src/p{number}.qrpj",
              PROJECT.format(number=number, dependency=dependency, files=quoted(names, " ")))
        write(f"{root}/tree/p{number}/p{number}.h", f"int p{number}();\n")
        for index, name in enumerate(names):
            write(f"{root}/tree/p{number}/src/{name}",
                  f'@import "p{number}/p{number}.h"\nint f{number}_{index}() {{ return {index}; }}\n')
        sources.append(names)
    return sources


# --- Generators

GN_TOOLCHAIN = """toolchain("gcc") {
  tool("cxx") {
    command = "g++ -c {{cflags}} {{include_dirs}} {{source}} -o {{output}}"
    outputs = [ "{{source_out_dir}}/{{target_output_name}}.{{source_name_part}}.o" ]
  }
  tool("alink") {
    command = "ar rcs {{output}} {{inputs}}"
    outputs = [ "{{target_out_dir}}/{{target_output_name}}.a" ]
  }
  tool("stamp") { command = "touch {{output}}" }
}
"""


# The compiler is given, since the search for it would take longer than all else; only sources are left to look at.
CMAKE_HEAD = """cmake_minimum_required(VERSION 3.16)
set(CMAKE_CXX_COMPILER g++)
set(CMAKE_CXX_COMPILER_ID GNU)
set(CMAKE_CXX_COMPILER_ID_RUN TRUE)
set(CMAKE_CXX_COMPILER_FORCED TRUE)
project(all CXX)
add_compile_options(-g -Wall)
"""

GENERATED = ["make*", "all.*", "*.cbp", "projects.guids", "out", "x64"]


def generation(root, projects, files):
    """Project files for one compiler. In root, `Qrex main.qrex` writes GENERATED, and `premake4 gmake`, `gn gen gn_out`
    and `cmake -B cmake_out` write a folder each."""
    sources = workspace(root, "gen", projects, files)
    targets = quoted([f"//tree/p{number}" for number in range(projects)], ", ")
    write(f"{root}/.gn", 'buildconfig = "//BUILDCONFIG.gn"\n')
    write(f"{root}/BUILDCONFIG.gn", 'set_default_toolchain("//:gcc")\n')
    write(f"{root}/BUILD.gn", GN_TOOLCHAIN + f'group("default") {{ deps = [ {targets} ] }}\n')
    solution = ['solution "all"\nlocation "premake4_out"\nconfigurations { "Debug" }\n']
    for number, names in enumerate(sources):
        paths = [f"src/{name}" for name in names]
        dependency = f'  deps = [ "//tree/p{number - 1}" ]\n' if number else ""
        write(f"{root}/tree/p{number}/BUILD.gn",
              f'static_library("p{number}") {{\n  cflags = [ "-g", "-Wall" ]\n  include_dirs = [ ".", "src", ".." ]\n'
              f'  sources = [ {quoted(paths, ", ")} ]\n{dependency}}}\n')
        write(f"{root}/tree/p{number}/CMakeLists.txt",
              f'add_library(p{number} STATIC {" ".join(paths)})\n'
              f'target_include_directories(p{number} PRIVATE . src ..)\n'
              + (f"target_link_libraries(p{number} PRIVATE p{number - 1})\n" if number else ""))
        solution.append(
            f'project "p{number}"\nlocation "premake4_out"\n'
            f'kind "StaticLib"\nlanguage "C++"\nflags {{ "Symbols" }}\nbuildoptions {{ "-Wall" }}\n'
            f'includedirs {{ "tree", "tree/p{number}", "tree/p{number}/src" }}\n'
            f'files {{ {quoted([f"tree/p{number}/{path}" for path in paths], ", ")} }}\n'
            + (f'links {{ "p{number - 1}" }}\n' if number else ""))
    write(f"{root}/premake4.lua", "".join(solution))
    write(f"{root}/CMakeLists.txt",
          CMAKE_HEAD + "".join(f"add_subdirectory(tree/p{number})\n" for number in range(projects)))


# --- Builds

# Stands for compiler and archiver: it makes its output, empty.
TOOL = """#!/bin/sh
if [ "$1" = rcs ]; then : > "$2"; exit; fi
read -r text < "${2#@}"
object=${text##*-o \\"}
: > "${object%%\\"*}"
"""


def add_tools(root, text):
    for name in ("gcc-4", "ar"):
        write(f"{root}/tools/{name}", text)
        os.chmod(f"{root}/tools/{name}", 0o755)


# Makes the object that the last `-o "..."` of its response file names, empty. A program: shells would be measured.
COMPILER = r"""#include <stdio.h>
#include <string.h>
#include <time.h>
int main(int count, char** words) {
  char text[4096];
  FILE* file = fopen(words[count - 1] + 1, "r");
  if (!file) return 2;
  text[fread(text, 1, sizeof text - 1, file)] = 0;
  char* object = text;
  for (char* next = text; (next = strstr(next, "-o \""));) object = next += 4;
  *strchr(object, '"') = 0;
  if (!fopen(object, "w")) return 2;
  struct timespec pause = {0, NANOSECONDS};
  return nanosleep(&pause, 0);
}
"""


def add_compiler(root, seconds):
    add_tools(root, TOOL)
    write(f"{root}/compiler.c", COMPILER)
    command = ["gcc", "-O1", f"-DNANOSECONDS={int(seconds * 1e9)}", "-o", f"{root}/tools/gcc-4", f"{root}/compiler.c"]
    subprocess.run(command, check=True)


def sleeping_build(root, files):
    """A build whose compiler sleeps: `Qrex main.qrex jobs=N` in root."""
    workspace(root, "build", 1, files)
    add_compiler(root, 0.1)


def used_header(root, users):
    """A header that all sources import, and a compiler that costs nothing: `Qrex main.qrex jobs=2`, and `ninja -j2` of
    the same commands with their response files."""
    [names] = workspace(root, "build", 1, users)
    add_compiler(root, 0)
    rules = ["rule compile\n  command = tools/gcc-4 -c @$out.rsp\n  rspfile = $out.rsp\n"
             '  rspfile_content = -g -Wall -I"tree/p0" -I"tree/p0/src" -I"tree" -o "$out" "$in"\n'
             "rule archive\n  command = tools/ar rcs $out @$out.rsp\n  rspfile = $out.rsp\n  rspfile_content = $in\n"]
    for name in names:
        rules.append(f"build ninja/{name}.o: compile tree/p0/src/{name} | tree/p0/p0.h\n")
    rules.append(f"build ninja/p0.a: archive {' '.join(f'ninja/{name}.o' for name in names)}\n")
    write(f"{root}/build.ninja", "".join(rules))


def compiled(root, files):
    """A build by g++, with standard headers in each source: `Qrex main.qrex jobs=2`, and `ninja -j2` of the same commands."""
    [names] = workspace(root, "build", 1, files)
    write(f"{root}/tree/p0/p0.h", "#include <map>\n#include <string>\nint p0();\n")
    options = "-g -Wall -Itree/p0 -Itree/p0/src -Itree"
    ninja = [f"rule compile\n  command = g++ -c {options} $in -o $out\nrule archive\n  command = ar rcs $out $in\n"]
    for name in names:
        path = f"tree/p0/src/{name}"
        text = f'@import "p0/p0.h"\nstd::map<std::string, int> of_{name[:-4]}() {{ return {{{{"a", 1}}}}; }}\n'
        write(f"{root}/{path}", text)
        write(f"{root}/plain/{path}", text.replace("@import", "#include"))
        ninja.append(f"build ninja/{name}.o: compile plain/{path}\n")
    ninja.append(f"build ninja/p0.a: archive {' '.join(f'ninja/{name}.o' for name in names)}\n")
    write(f"{root}/build.ninja", "".join(ninja))


def build(root, projects, files):
    """A build whose tools cost nothing: `Qrex main.qrex`, `ninja` and `make -rR` in root."""
    sources = workspace(root, "build", projects, files)
    add_tools(root, TOOL)
    ninja, make, targets = ["rule make\n  command = : > $out\n"], [], []
    for number, names in enumerate(sources):
        objects = [f"p{number}/{name}.o" for name in names]
        for made, name in zip(objects, names):
            inputs = [f"tree/p{number}/src/{name}", f"tree/p{number}/p{number}.h"]
            ninja.append(f"build ninja/{made}: make {inputs[0]} | {inputs[1]}\n")
            make.append(f"make/{made}: {' '.join(inputs)}\n\t: > $@\n")
        ninja.append(f"build ninja/p{number}.a: make {' '.join(f'ninja/{made}' for made in objects)}\n")
        make.append(f"make/p{number}.a: {' '.join(f'make/{made}' for made in objects)}\n\t: > $@\n")
        targets.append(f"make/p{number}.a")
        os.makedirs(f"{root}/make/p{number}")
    write(f"{root}/build.ninja", "".join(ninja))
    write(f"{root}/Makefile", f"all: {' '.join(targets)}\n" + "".join(make))
