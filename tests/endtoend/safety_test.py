#!/usr/bin/env python3
"""What names, tools, other runs and the system may do to a build: nothing but the tools that it names runs, each run that
calls tools has its folder for itself, and what is in the way is told."""

import os
import subprocess
import sys
import time
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import SETTINGS, Workspace, equal, holds, in_workspace, lacks, run_tests  # noqa: E402

PROJECT = """$TARGET_TYPE = "Console Application"
$ROOT_TO_PROJDIR = "%s"
qrex
config { "%s|%s" }
{ "src" { "a.cpp" } }
"""
FILES = {
    "all.qrex": SETTINGS,
    "tree/.qrwsroot": "",
    "tree/all.qrws": '"all" { "app" }\n',
    "tree/app/src/a.cpp": "int main() { return 0; }\n",
    "tree/app/src/app.qrpj": PROJECT % ("app", "Debug", "x64"),
}
# Names that the shell would run, or end a word at; each would leave a file behind.
NAMES = ["$(touch RAN)", "`touch RAN`", "a;touch RAN;b", "a&touch RAN&", "$HOME", "a' b", "a, b", "~", "a*", "-x", "@x"]


def names_do_not_run(binary):
    for name in NAMES:
        settings = SETTINGS.replace('"x64"', f'"{name}"').replace('"Debug"', f'"{name}"').replace("out/lib", name)
        files = {
            "all.qrex": settings + f'virtualTree = {{ "tree {name}" }}\n',
            f"tree {name}/.qrwsroot": "",
            f"tree {name}/all.qrws": f'"all" {{ "{name}" }}\n',
            f"tree {name}/{name}/src/a.cpp": "int main() { return 0; }\n",
            f"tree {name}/{name}/src/{name}.qrpj": PROJECT % (name, name, name),
        }
        with Workspace(binary, files) as workspace:
            holds(workspace.run("all.qrex"), "\nCompleted..")
            assert not list(workspace.folder.rglob("RAN")), f"{name} was run"
            assert workspace.path(f"{name}/{name}/{name}/{name}").exists(), f"{name} is not built"
            output = workspace.run("all.qrex", "mode=gen")
            if set(name) & set("$`;'"):
                equal([path.name for path in workspace.folder.glob("*make*")], [])
                holds(output, f"Error : Make file make_{name}_{name}_{name} would run parts of the name {name}/{name}/{name}/",
                      "Error : Make file makefile would run parts of the name ")


# Sources whose names the tools must get as they are, in a folder whose own name would be a switch that runs a program.
@in_workspace({}, "g++", "make")
def sources_and_folders_are_names(workspace):
    folder = 'x" -wrapper .,EVIL "y/'
    names = ["a\\b.cpp", "a b.cpp", "a'b.cpp", "-x.cpp", "@x.cpp", "#a.cpp", "$(touch RAN).cpp"]
    project = PROJECT.replace("qrex", "+cpp { -fPIC } qrex").replace('"a.cpp"', '"*.cpp"') % ("app", "Debug", "x64")
    for name, text in {**FILES, "tree/app/src/app.qrpj": project.replace("Console Application", "Dynamic-Link Library")}.items():
        workspace.write(folder + name, text)
    for number, name in enumerate(names):
        workspace.write(f"{folder}tree/app/src/{name}", f"int Named{number};\n")
    output = workspace.shell(f"cd '{folder}' && Qrex all.qrex")
    holds(output, "\nCompleted..")
    symbols = workspace.shell(f"cd '{folder}' && nm -D out/lib/x64/Debug/libapp.so && Qrex all.qrex mode=gen")
    holds(symbols, *[f"Named{number}\n" for number in range(len(names))])
    holds(symbols, "Error : Make file make_app_x64_Debug would run parts of the name qrexsource/x64/Debug/app/src/")
    workspace.write(f"{folder}tree/app/src/a\nb.cpp", "int Line;\n")
    output = workspace.shell(f"cd '{folder}' && Qrex all.qrex")
    holds(output, "ERROR: No tool can be given the name qrexsource/x64/Debug/app/src/a\nb.cpp : a line ends in it\n",
          "\nCompleted with 0 warnings, 1 errors.")
    lacks(output, "Linking...")
    assert not list(workspace.folder.rglob("RAN"))


def a_quote_in_a_name_is_refused(binary):
    changes = [("tree/all.qrws", '"all" { "a\\"pp" }\n', 'tree/all.qrws(1) : ', '"a\\"pp"'),
               ("tree/app/src/app.qrpj", PROJECT % ("app", 'De\\"bug', "x64"), "app.qrpj(4) : ", '"De\\"bug|x64"'),
               ("tree/app/src/app.qrpj", (PROJECT % ("app", "Debug", "x64")).replace('"a.cpp"', '"a.cpp" as "a\\"a.cpp"'),
                "app.qrpj(5) : ", '"a\\"a.cpp"'),
               ("all.qrex", SETTINGS + 'config = "De\\"bug"\n', "all.qrex(13) : ", '"De\\"bug"'),
               ("all.qrex", SETTINGS + '$TARGET_DIR = "De\\"bug/x64"\n', "all.qrex(13) : ", '"De\\"bug/x64"'),
               ("all.qrex", SETTINGS + 'virtualTree = { "tr\\"ee" }\n', "all.qrex(13) : ", '"tr\\"ee"')]
    for path, text, place, name in changes:
        with Workspace(binary, {**FILES, path: text}) as workspace:
            holds(workspace.run("all.qrex", status=1), place + "A double quote can't stand in " + name)
    with Workspace(binary, {**FILES, "tree/app/src/app.qrpj": PROJECT.replace('"a.cpp"', '"*.cpp"') % ("app", "Debug", "x64"),
                            'tree/app/src/b"b.cpp': ""}) as workspace:
        holds(workspace.run("all.qrex", status=1), "A double quote can't stand in app/src/b\"b.cpp")


SLOW_COMPILER = """#!/bin/sh
[ -e busy ] && echo "a.cpp:1: error: not alone"
touch busy; sleep 0.3; rm busy
exec g++ "$@"
"""


@in_workspace({**FILES, "tools/gcc-4": SLOW_COMPILER}, "g++")
def builds_in_one_folder_follow_each_other(workspace):
    first = subprocess.Popen([workspace.binary, "all.qrex"], cwd=workspace.folder, stdout=subprocess.PIPE, text=True)
    while not workspace.path("busy").exists():
        assert first.poll() is None, first.stdout.read()
        time.sleep(0.01)
    holds(workspace.run("all.qrex"), f"Waiting for process {first.pid}, which builds in this folder\n", "\nCompleted..")
    lacks(first.communicate()[0], "error")
    assert first.returncode == 0
    lacks(workspace.run("all.qrex", "translateOnly=true"), "Waiting")


@in_workspace({**FILES, "tools/gcc-4": '#!/bin/sh\necho "a.cpp:1: warning: $LC_ALL"\n'})
def tools_speak_english(workspace):
    holds(workspace.run("all.qrex", LC_ALL="de_DE.UTF-8"), "warning: C\n")


@in_workspace({**FILES, "tree/app/src/a.cpp": "int broken\n" + "//\n" * 4000})
def writes_beyond_the_limit_of_file_sizes_fail(workspace):
    output = workspace.shell("ulimit -f 8; exec Qrex all.qrex", status=1)
    holds(output, "Error: File error (qrexsource/x64/Debug/app/src/a.cpp) : The file size exceeds the limit allowed")


def a_folder_that_cannot_be_listed_is_told(binary):
    library = os.environ.get("QREX_FAULTS")  # the superuser lists any folder: the call itself has to fail
    folder = Path(__file__).resolve().parents[1] / "faults"
    with Workspace(binary, {**FILES, "tree/app/src/app.qrpj": PROJECT.replace('"a.cpp"', '"*.cpp"')
                            % ("app", "Debug", "x64")}) as workspace:
        if not library:
            library = str(workspace.path("inject.so"))
            subprocess.run(["cc", "-shared", "-fPIC", "-o", library, folder / "inject.c", "-ldl"], check=True)
        for call in ("opendir", "readdir"):
            # A sanitizer wants to be the first library of the process.
            sanitizer = os.environ.get("ASAN_OPTIONS", "") + ":verify_asan_link_order=0"
            done = subprocess.run([binary, "all.qrex", "translateOnly=true"], cwd=workspace.folder, stdout=subprocess.PIPE,
                                  text=True, env={**os.environ, "LD_PRELOAD": library, "FAULT_CALL": call, "FAULT_AT": "1",
                                                  "FAULT_HOW": "fail", "FAULT_ERRNO": "13", "FAULT_STICKS": "1",
                                                  "ASAN_OPTIONS": sanitizer})
            equal(done.returncode, 1)
            holds(done.stdout, "app.qrpj(5) : Couldn't list folder tree/app/src : Access is denied.\n")


run_tests([names_do_not_run, sources_and_folders_are_names, a_quote_in_a_name_is_refused, builds_in_one_folder_follow_each_other, tools_speak_english,
           writes_beyond_the_limit_of_file_sizes_fail, a_folder_that_cannot_be_listed_is_told])
