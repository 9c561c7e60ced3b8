#!/usr/bin/env python3
"""The dependency file of a run, as ninja and make read it: what changes any file that the run read calls it again, and
nothing else does."""

import os
import time

from workspace_fixture import DRIVE, SETTINGS, equal, holds, in_workspace, lacks, project, run_tests, workspace_of

NAMES = ["a b.h", "c$d.h", "e#f.h", "g:h.h", "i\\j.h", "back\\ slash.h", "k%l.h", "o(p)~[q].h", "a=b.h", "s,t+u@v!w.h", "x$$y.h",
         "{curly}.h", "-minus.h", "ü.h"]
if DRIVE:  # such names are not for every system
    NAMES = [name for name in NAMES if not set(name) & set(":\\")]
FILES = {
    **workspace_of("lib", "app"),
    "all.qrex": '@import "settings.inc"\n' + SETTINGS + 'translateOnly = true\ndepfile = "out/app.d"\n',
    "settings.inc": "modernCpp = true\n",
    "tree/app/src/app.qrpj": project("Console Application", "app", '"src" { "*.h" "*.cpp" }', '@import "common.inc"'),
    "tree/common.inc": "+cpp { -O1 }\n",
    "tree/app/src/app.cpp": '@import "lib/lib.h"\nint main() { return zero(); }\n',
    **{f"tree/app/src/{name}": "int unused();\n" for name in NAMES},
    "tree/lib/src/lib.qrpj": project("Static Library", "lib", '"lib.h"'),
    "tree/lib/lib.h": "inline int zero() { return 0; }\n",
}
READ = ["all.qrex", "settings.inc", "tree/all.qrws", "tree/common.inc", "tree/app/src/app.qrpj", "tree/lib/src/lib.qrpj",
        "tree/lib/lib.h", "tree/app/src/app.cpp", *(f"tree/app/src/{name}" for name in NAMES)]
NINJA = """rule translate
  command = Qrex all.qrex && touch $out
  deps = gcc
  depfile = out/app.d
  restat = 1
build stamp qrexsource/x64/Debug/app/src/app.cpp: translate
"""
MAKE = "all: out/app.d\nout/app.d: ; Qrex all.qrex\ninclude out/app.d\n"


def is_asked_again(workspace, command, idle):
    """Edits each file that the run reads, adds one and removes one. `idle`: what the command says when nothing is to do."""
    def settle():
        workspace.shell(command)
        holds(workspace.shell(command), idle)
    settle()
    unseen = []
    for name in READ:
        time.sleep(0.01)  # a tick of the clock of stamps
        workspace.append(name, "\n")
        if "Completed" not in workspace.shell(command):
            unseen.append(name)
        holds(workspace.shell(command), idle)
    equal(unseen, [])
    workspace.write("tree/app/src/new.cpp", "int fresh;\n")
    workspace.shell(command)
    assert workspace.path("qrexsource/x64/Debug/app/src/new.cpp").exists()
    os.remove(workspace.path(f"tree/app/src/{NAMES[0]}"))
    holds(workspace.shell(command), "Completed")
    settle()


@in_workspace({**FILES, "build.ninja": NINJA}, "ninja")
def test_ninja(workspace):
    is_asked_again(workspace, "ninja -v", "no work to do")
    lacks(workspace.shell("ninja -t deps"), "stale")
    equal(workspace.times("out/*.d"), {})  # read into ninja's own log


@in_workspace({**FILES, "makefile": MAKE}, "make")
def test_make(workspace):
    is_asked_again(workspace, "make", "Nothing to be done")
    holds(workspace.path("out/app.d").read_text(), "out/app.d qrexsource/x64/Debug/lib/lib.h out/include/lib/lib.h "
          "out/source/lib/lib.h qrexsource/x64/Debug/app/src/-minus.h", "app.cpp: \\\n  all.qrex \\\n")


@in_workspace({**FILES, "elsewhere/none": ""})
def test_from_another_folder(workspace):
    """A build has its outputs where it likes; the configuration is as it is."""
    workspace.run("all.qrex")
    here = workspace.path("out/app.d").read_text()
    workspace.shell("cd elsewhere && Qrex ../all.qrex 'sourceFolder=\"..\"'")
    there = workspace.path("elsewhere/out/app.d").read_text()
    equal([line.replace("../", "") for line in there.splitlines()], here.splitlines())
    equal(workspace.times("elsewhere/qrexsource/**/*.h").keys(), {f"elsewhere/{name}" for name in workspace.times("qrexsource/**/*.h")})
    workspace.append("tree/lib/lib.h", "$class {\n")
    holds(workspace.shell("cd elsewhere && Qrex ../all.qrex 'sourceFolder=\"..\"'", status=1), "\n../tree/lib/lib.h(2) : ")


@in_workspace(FILES, "g++")
def test_modes_and_failures(workspace):
    """One is written behind a run that has done all that it was told, and is whole or as it was."""
    workspace.run("all.qrex", "mode=gen", "compiler=gcc")
    text = workspace.path("out/app.d").read_text()
    holds(text, "out/app.d all.projects make_lib_x64_Debug lib.cbp make_app_x64_Debug app.cbp ", " makefile ", ": \\\n  all.qrex ")
    lacks(text, "app.cpp")
    for arguments in (["mode=clean"], ["mode=show", '$COMPILE_FILE_PATH = "tree/app/src/app.cpp"']):
        workspace.write("tree/.qrwsroot", "")
        workspace.run("all.qrex", *arguments)
        equal(workspace.path("out/app.d").read_text(), text)
    workspace.append("tree/lib/lib.h", "$class {\n")
    workspace.run("all.qrex", status=1)
    equal(workspace.path("out/app.d").read_text(), text)
    workspace.write("tree/lib/lib.h", "inline int zero() { return nothing; }\n")
    holds(workspace.run("all.qrex", "translateOnly=false", status=1), "'nothing' was not declared", " errors")
    workspace.write("tree/lib/lib.h", "inline int zero() { return 0; }\n")
    workspace.write("tree/app/src/app.cpp", "int main() {}\n")
    workspace.replace("tree/lib/src/lib.qrpj", "qrex", "qrix")
    output = workspace.run("all.qrex", 'workspaces = { "app" "lib" }', status=1)
    holds(output, "lib.qrpj(5) : ", "Completed")
    workspace.replace("tree/lib/src/lib.qrpj", "qrix", "qrex")
    equal(workspace.path("out/app.d").read_text(), text)
    holds(workspace.run("all.qrex", 'depfile="tree/all.qrws/app.d"', status=1), "Error: ", "tree/all.qrws/app.d")


run_tests(globals())
