#!/usr/bin/env python3
"""What the first argument may ask for in place of a run: a new workspace, which builds and runs, help and the release."""

import os
import re
import shutil
import subprocess

from workspace_fixture import COMPILERS, ROOT, contents, equal, holds, in_workspace, run_tests


@in_workspace({}, "git")
def test_nothing_that_is_generated_is_to_be_committed(workspace):
    workspace.run("--init", "zoo", ".")
    workspace.shell("git init -q . && git add -A")
    for compiler in COMPILERS:
        for arguments in (["mode=gen", "ninja=true"], ["translateOnly=true"]):
            holds(workspace.run("zoo.qrex", f"compiler={compiler}", *arguments), "Completed.")
    holds(workspace.path("build_zoo.sln").read_text(encoding="utf-8-sig"), "zoo_core", "zoo_app")
    equal(workspace.shell("git ls-files --others --exclude-standard"), "")


PROJECT = '$TARGET_TYPE = "%s"\n$ROOT_TO_PROJDIR = "%s"\n@import "common.inc"\nsubproj { %s }\nqrex\n{ "src" { "*.cpp" } }\n'
TARGETS = {
    "zoo.qrws": '"zoo" { "base" "shared" "app" }\n',
    "base/src/base.qrpj": PROJECT % ("Static Library", "base", ""),
    "base/src/base.cpp": "int g_base = 1;\nint Base() { return g_base; }\n",
    "shared/src/shared.qrpj": PROJECT % ("Dynamic-Link Library", "shared", '"base"'),
    "shared/src/shared.cpp": "int Base();\nint Shared() { return Base() + 1; }\n",
    "app/src/app.qrpj": PROJECT % ("Console Application", "app", '"shared"'),
    "app/src/app.cpp": "int Shared();\nint main() { return Shared() - 2; }\n",
}


@in_workspace({}, "g++", "clang++", "make")
def test_every_target_type_is_built_and_runs(workspace):
    """By the tool and by make; wherever the targets are moved."""
    workspace.run("--init", "zoo", ".")
    for name, text in TARGETS.items():
        workspace.write("tree/" + name, text)
    for compiler in ("gcc", "clang"):
        workspace.run("zoo.qrex", f"compiler={compiler}", "mode=gen")
        for config, target in (("Debug", "d"), ("Release", "r")):
            for command in (f"Qrex zoo.qrex compiler={compiler} 'config=\"{config}\"'", f"make -j2 {target}"):
                workspace.shell(f"find x64 out -type f -delete; rm -rf moved && {command} && cp -r out/lib moved")
                workspace.shell(f"find out -type f -delete; moved/x64/{config}/app")


@in_workspace({})
def test_nothing_is_overwritten(workspace):
    workspace.write("zoo/tree/common.inc", "mine\n")
    output = workspace.run("--init", "zoo", status=1)
    equal(output, "Error: zoo/tree/common.inc is there already; nothing was written\n")
    for name in ("", "1a", "a-b", "a/b", "ä"):
        holds(workspace.run("--init", name, status=1), "can't name a workspace")
    for arguments in ((), ("a", "b", "c")):
        equal(workspace.run("--init", *arguments, status=1), "Usage: Qrex --init NAME [FOLDER]\n")
    equal(contents(workspace.folder, "**/*"), {"zoo/tree/common.inc": b"mine\n"})


@in_workspace({})
def test_templates_are_found_where_an_installation_puts_them(workspace):
    for folder, data in (("beside", "beside"), ("installed/bin", "installed/share/qrex")):
        os.makedirs(workspace.path(folder), exist_ok=True)
        shutil.copy(workspace.binary, workspace.path(folder))
        for part in ("templates", "runtime"):
            shutil.copytree(ROOT / part, workspace.path(data) / part)
        os.symlink(workspace.path(folder) / "Qrex", workspace.path("link"))
        for of, arguments in ((".", ["--init", "w", f"of/{folder}"]), (f"of/{folder}", ["w.qrex", "translateOnly=true"])):
            subprocess.run([workspace.path("link"), *arguments], cwd=workspace.path(of), check=True, stdout=subprocess.DEVNULL)
        workspace.path("link").unlink()
    # Where the system does not tell the program's path: by the word that it is called by.
    hide = "unshare -rm sh -c 'mount -t tmpfs none /proc && %s'"
    if subprocess.run(hide % "true", shell=True, capture_output=True).returncode == 0:
        for number, call in enumerate(("installed/bin/Qrex", "../../bin/Qrex", "PATH=none:beside:$PATH Qrex")):
            folder = "installed/share/qrex" if call.startswith("..") else "."
            workspace.shell(f"cd {folder} && " + hide % f"{call} --init w {workspace.folder}/hidden{number}")
    shutil.copy(workspace.binary, workspace.path("alone"))
    for status, environment in ((1, {}), (0, {"QREX_DATA_FOLDER": str(workspace.path("beside"))})):
        for of, arguments in ((".", ["--init", "w"]), ("of/beside", ["w.qrex", "translateOnly=true"])):
            done = subprocess.run([workspace.path("alone"), *arguments], cwd=workspace.path(of), env=environment,
                                  capture_output=True, text=True)
            equal(done.returncode, status)
            holds(done.stdout, *([f"No {'templates/workspace and ' * (of == '.')}runtime in any of\n"] * status))


@in_workspace({"--help": ""})
def test_help_and_release(workspace):
    version = re.search(r"project\(Qrex VERSION (\S+)", (ROOT / "CMakeLists.txt").read_text()).group(1)
    equal(workspace.run("--version"), f"Qrex {version}\n")
    output = workspace.run("--help")
    holds(output, version, "--init NAME [FOLDER]", "mode = WORD", "  build ", "the default", "  compiler = vc8 ",
          "  defaultToDll = true ", "  diagnostics = false ", "  $EXPORT_LIB = ")
    equal([line for line in output.splitlines() if len(line) > 120], [])
    # Behind an assignment it is a file like any other.
    holds(workspace.run('a="b"', "--version", status=1), "Exception: Couldn't open file --version")
    holds(workspace.run("--versions", status=1), "Exception: Couldn't open file --versions")


run_tests(globals())
