#!/usr/bin/env python3
"""build.ninja in the hands of ninja: what it builds is what a run of the tool does, and what it leaves alone."""

import json
import os
import re
import shutil

from workspace_fixture import PROGRAM_FILES as FILES, SETTINGS, Workspace, equal, holds, in_workspace, lacks, need, run_tests

GEN = ["all.qrex", "mode=gen", "ninja=true"]
NOTHING = "ninja: no work to do.\n"


def settle(workspace, targets=""):
    workspace.shell(f"ninja {targets}")
    equal(workspace.shell(f"ninja {targets}"), NOTHING)


@in_workspace(FILES, "ninja", "g++")
def test_builds_what_a_run_builds(workspace):
    """Each edit makes the same objects and targets as a run does in a copy, and their bytes are the same."""
    workspace.run("all.qrex")
    ninja = workspace.path("ninja")
    shutil.copytree(workspace.folder / "tree", ninja / "tree")
    workspace.write("ninja/all.qrex", SETTINGS)
    workspace.shell("cd ninja && Qrex all.qrex mode=gen ninja=true && ninja")
    equal(workspace.shell("cd ninja && ninja"), NOTHING)
    equal(workspace.shell("out/lib/x64/Debug/app"), "a $ debug 1 2\n")
    equal(workspace.shell("cd ninja && out/lib/x64/Debug/app"), "a $ debug 1 2\n")

    def stamps():
        return {**workspace.times("**/x64/Debug/*/*.o"), **workspace.times("**/out/lib/x64/Debug/*")}

    for name, old, new in (("lib/lib.h", "int lib();", "int lib(); int more();"), ("app/src/the kind.h", "int", "extern int"),
                           ("dll/src/dll.cpp", "2", "3"), ("app/src/app.cpp", "%d\\n", "%d.\\n")):
        before = stamps()
        for folder in ("", "ninja/"):
            workspace.edit(f"{folder}tree/{name}", old, new)
        workspace.run("all.qrex")
        workspace.shell("cd ninja && ninja")
        made = {name for name, stamp in stamps().items() if before[name] != stamp}
        by_run = {name for name in made if not name.startswith("ninja/")}
        equal(made, by_run | {f"ninja/{name}" for name in by_run})
        equal(workspace.shell("cd ninja && ninja"), NOTHING)
    for name in [name for name in stamps() if not name.startswith("ninja/")]:
        equal((name, workspace.path(name).read_bytes() == (ninja / name).read_bytes()), (name, True))


@in_workspace(FILES, "ninja", "g++")
def test_names(workspace):
    """Configurations and projects by their names; all commands can be told."""
    workspace.run(*GEN)
    holds(workspace.shell("ninja app-Release"), "Translating Release|x64", "Linking out/lib/x64/Release/app")
    equal(workspace.times("x64/Debug/**/*.o"), {})
    equal(workspace.shell("out/lib/x64/Release/app"), "release 1 2\n")
    equal(workspace.shell("ninja Release"), NOTHING)
    holds(workspace.shell("ninja lib"), "Linking out/lib/x64/Debug/liblib.a")
    equal(workspace.times("x64/Debug/app/*.o"), {})
    settle(workspace, "all")
    commands = json.loads(workspace.shell("ninja -t compdb compile"))
    equal(sorted(command["output"] for command in commands if "Debug" in command["output"]),
          ["x64/Debug/app/app.o", "x64/Debug/app/the kind.o", "x64/Debug/dll/dll.o", "x64/Debug/lib/lib.o"])
    kind, = [command for command in commands if command["output"] == "x64/Debug/app/the kind.o"]
    workspace.path("x64/Debug/app/the kind.o").unlink()
    workspace.shell(f"cd '{kind['directory']}' && {kind['command']}")
    assert workspace.path("x64/Debug/app/the kind.o").exists()
    json.loads(workspace.shell("ninja -t compdb"))
    workspace.shell("ninja -t clean")
    equal([*workspace.times("x64/**/*.o"), *workspace.times("qrexsource/**/*.h"), *workspace.times("out/lib/**/*.a")], [])
    settle(workspace, "-j8 all")


@in_workspace(FILES, "ninja", "g++")
def test_follows_changes(workspace):
    """The file is written anew by itself; a changed switch compiles what has it."""
    workspace.run(*GEN)
    settle(workspace)
    written = workspace.path("build.ninja").read_bytes()
    workspace.edit("tree/app/src/app.qrpj", '-DKIND="a $ debug"', '-DKIND="other"')
    equal(sorted(re.findall(r"Compiling (.*)", workspace.shell("ninja"))),
          ["'qrexsource/x64/Debug/app/src/the kind.cpp'", "qrexsource/x64/Debug/app/src/app.cpp"])
    equal(workspace.shell("ninja && out/lib/x64/Debug/app"), NOTHING + "other 1 2\n")
    workspace.edit("tree/app/src/app.qrpj", '-DKIND="other"', '-DKIND="a $ debug"')
    settle(workspace)
    equal(workspace.path("build.ninja").read_bytes(), written)
    workspace.write("tree/lib/src/new.cpp", "int fresh() { return 3; }\n")
    holds(workspace.shell("ninja"), "Compiling qrexsource/x64/Debug/lib/src/new.cpp", "Linking out/lib/x64/Debug/liblib.a")
    holds(workspace.shell("ar t out/lib/x64/Debug/liblib.a"), "new.o")
    os.remove(workspace.path("tree/lib/src/new.cpp"))
    workspace.shell("ninja")
    lacks(workspace.shell("ar t out/lib/x64/Debug/liblib.a"), "new.o")
    equal(workspace.shell("ninja"), NOTHING)
    workspace.path("qrexsource/x64/Debug/lib/lib.h").unlink()
    holds(workspace.shell("ninja"), "Looking at translations of Debug|x64")
    assert workspace.path("qrexsource/x64/Debug/lib/lib.h").exists()
    settle(workspace)
    workspace.edit("all.qrex", "compiler = gcc", "modernCpp = true compiler = gcc")
    holds(workspace.shell("ninja"), "Writing build.ninja", "Translating Debug|x64")
    settle(workspace)


@in_workspace(FILES, "ninja", "g++")
def test_stops_at_errors(workspace):
    workspace.run(*GEN)
    workspace.edit("tree/lib/src/lib.cpp", "return 1", "return one")
    text = workspace.shell("ninja -k 0", status=1, LC_ALL="C")
    holds(text, "FAILED: x64/Debug/lib/lib.o", "'one' was not declared", "ninja: build stopped")
    assert workspace.path("out/lib/x64/Debug/libdll.so").exists() and not workspace.path("out/lib/x64/Debug/app").exists()
    workspace.edit("tree/lib/src/lib.cpp", "return one", "return 1")
    workspace.edit("tree/lib/lib.h", "int lib();", "$class { };")
    text = workspace.shell("ninja", status=1)
    holds(text, "FAILED: qrexsource/x64/Debug/.translated \n", "tree/lib/lib.h(1) : error : ", "ninja: build stopped")
    equal(workspace.shell("ninja", status=1).count("FAILED"), 1)
    workspace.edit("tree/lib/lib.h", "$class { };", "int lib();")
    workspace.replace("tree/common.inc", "config", "confug")
    holds(workspace.shell("ninja", status=1), "FAILED: build.ninja", "tree/lib/src/lib.qrpj(3) : ")
    workspace.replace("tree/common.inc", "confug", "config")
    settle(workspace)


@in_workspace(FILES, "ninja", "g++")
def test_translator_takes_its_time(workspace):
    """Nothing is compiled ahead of what it includes. The tool is called as it was, also by a wrapper."""
    workspace.run(*GEN)
    workspace.write("slow", f'#!/bin/sh\nsleep 0.5\nexec "{workspace.binary}" "$@"\n')
    workspace.replace("build.ninja", f"qrex = {workspace.binary}", f"qrex = {workspace.folder}/slow")
    settle(workspace, "-j8 -d explain > log; touch build.ninja; ninja -j8")
    shutil.rmtree(workspace.path("qrexsource"))
    settle(workspace, "-j8")


def test_clang_and_a_tree_elsewhere(binary):
    need("ninja", "clang++")
    with Workspace(binary, FILES) as workspace:
        workspace.write("a build/none", "")
        workspace.shell("cd 'a build' && Qrex 'NAME=\"it'\\''s\"' ../all.qrex mode=gen ninja=true compiler=clang "
                        "'sourceFolder=\"..\"' && ninja && out/lib/x64/Debug/app")
        holds(workspace.path("a build/build.ninja").read_text(), "clang++")
        workspace.shell("touch tree/lib/src/lib.qrpj")
        equal(workspace.shell("cd 'a build' && ninja > log && ninja"), NOTHING)


run_tests(globals())
