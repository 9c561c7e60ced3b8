#!/usr/bin/env python3
"""Builds with the real tools of the gcc family. Through make files: examples_test.py and init_test.py."""

from workspace_fixture import PROGRAM_FILES as FILES, equal, holds, in_workspace, lacks, project, run_tests, workspace_of

PROGRAM = "out/lib/x64/Debug/app"
RESULT = "a $ debug 1 2\n"
OBJECTS = "x64/**/*.o"
LIBRARIES = "out/lib/x64/Debug/*"


@in_workspace(FILES, "g++")
def test_builds_libraries_and_a_program_and_only_what_is_stale(workspace):
    output = workspace.run("all.qrex")
    holds(output, "- lib  [", "Linking...", "- dll  [", "Linking...", "- app  [", "Linking...", "\nCompleted....")
    equal(workspace.shell(f"cd / && {workspace.path(PROGRAM)}"), RESULT)  # finds its library from anywhere

    objects, targets = workspace.times(OBJECTS), workspace.times(LIBRARIES)
    lacks(workspace.run("all.qrex"), "Linking...")
    equal(workspace.changed(objects, OBJECTS) + workspace.changed(targets, LIBRARIES), [])

    workspace.append("tree/lib/lib.h", "int More();\n")
    workspace.run("all.qrex")
    equal(workspace.changed(objects, OBJECTS), ["x64/Debug/app/app.o", "x64/Debug/lib/lib.o"])
    equal(workspace.changed(targets, LIBRARIES), ["out/lib/x64/Debug/app", "out/lib/x64/Debug/liblib.a"])
    equal(workspace.shell(PROGRAM), RESULT)


@in_workspace(FILES, "g++")
def test_messages_point_at_the_source(workspace):
    workspace.append("tree/lib/lib.h", "inline int Broken()\n{\n    return nowhere;\n}\n")
    workspace.append("tree/app/src/the kind.cpp", "static int unused;\n")
    output = workspace.run("all.qrex")
    # Each file that imports the header reports it, at the line of the source. Compiling goes on, the program is not linked.
    holds(output, "tree/lib/lib.h(4) ...\n", "qrexsource/x64/Debug/lib/lib.h:",
          ": error: 'nowhere' was not declared in this scope\n", "- app  [",
          "tree/app/src/the kind.cpp(3) ...\n", "warning: 'unused' defined but not used",
          "\nCompleted with 1 warnings, 2 errors.")
    equal(sorted(workspace.times(OBJECTS)), ["x64/Debug/app/the kind.o", "x64/Debug/dll/dll.o"])
    equal(list(workspace.times(LIBRARIES)), ["out/lib/x64/Debug/libdll.so"])
    workspace.replace("tree/lib/lib.h", "nowhere", "0")
    holds(workspace.run("all.qrex"), "\nCompleted....")
    equal(workspace.shell(PROGRAM), RESULT)


@in_workspace({**workspace_of("app"), "tree/app/src/x.cpp": 'extern "C" int V();\nint main() { return V(); }\n',
               "tree/app/src/app.qrpj": project("Application", "app", '"src" { "x.cpp" }', '+link { "vendor/$(Platform).a" }')}, "g++")
def test_a_library_that_switches_name_is_linked_anew(workspace):
    for number in (10, 20):
        workspace.write("one.c", f"int V() {{ return {number}; }}\n")
        workspace.shell("mkdir -p vendor && gcc -c one.c && ar rcs vendor/x64.a one.o")
        holds(workspace.run("all.qrex"), "Linking...", "\nCompleted....")
        workspace.shell(f"cd / && {workspace.path(PROGRAM)}", status=number)
        lacks(workspace.run("all.qrex"), "Linking...")


@in_workspace(FILES, "g++")
def test_captured_output_that_cannot_be_kept_is_an_error(workspace):
    workspace.write("tools/gcc-4", "#!/bin/sh\nhead -c 3000000 /dev/zero | tr '\\0' x\n")
    output = workspace.shell("ulimit -f 2000; Qrex all.qrex")  # blocks: none of the files of a run is as large
    holds(output, "cmd /c gcc-4 -c @\"x64/Debug/lib/compiler.rsp\" 1>out1.txt 2>&1\n"
          "ERROR getting stdout\n", "x64/Debug/lib/compiler.rsp: ", "\nCompleted with 0 warnings, 4 errors.")
    workspace.path("tools/gcc-4").unlink()
    workspace.run("all.qrex")
    equal(workspace.shell(PROGRAM), RESULT)


run_tests(globals())
