#!/usr/bin/env python3
"""Ends the tool by signals at random points of its runs, with its tools or alone. No file is half-written. The run after
must complete, end with the same files as an undisturbed run, and leave nothing to do for the next one.

interrupt_test.py BINARY [ROUNDS]: signals per kind of run, 15 unless given."""

import os
import random
import re
import signal
import subprocess
import sys
import time
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import SETTINGS, Workspace, need, run_tests  # noqa: E402

ROUNDS = int(sys.argv[2]) if len(sys.argv) > 2 else 15
PROJECTS = 8
SIGNALS = [signal.SIGKILL, signal.SIGKILL, signal.SIGTERM, signal.SIGHUP, signal.SIGINT, signal.SIGQUIT]
WHOLE = ("qrexsource/", "out/include/", "out/source/")  # what the tool itself writes


def files():
    """Libraries of a few files each, and a program that uses all of them."""
    result = {"all.qrex": SETTINGS, "tree/.qrwsroot": ""}
    libraries = [f"lib{i}" for i in range(PROJECTS)]
    result["tree/all.qrws"] = '"all" { ' + " ".join(f'"{name}"' for name in libraries) + ' "app" }\n'
    for i, name in enumerate(libraries):
        result[f"tree/{name}/src/{name}.qrpj"] = f"""$TARGET_TYPE = "Static Library"
$ROOT_TO_PROJDIR = "{name}"
qrex
config {{ "Debug|x64" }}
{{ "{name}.h" "src" {{ "{name}.cpp" "more.cpp" }} }}
"""
        result[f"tree/{name}/{name}.h"] = f"@def value{i} = {i}\nint f{i}();\n" + "// padding\n" * 2000
        result[f"tree/{name}/src/{name}.cpp"] = f'@import "{name}/{name}.h"\nint f{i}() {{ return value{i}; }}\n'
        result[f"tree/{name}/src/more.cpp"] = f"$init {{ }}\nint more{i};\n"
    calls = " + ".join(f"f{i}()" for i in range(PROJECTS))
    imports = "".join(f'@import "{name}/{name}.h"\n' for name in libraries)
    subprojects = " ".join(f'"{name}"' for name in libraries)
    result["tree/app/src/app.cpp"] = imports + f"int main() {{ return {calls} == {sum(range(PROJECTS))} ? 0 : 1; }}\n"
    result["tree/app/src/app.qrpj"] = f"""$TARGET_TYPE = "Console Application"
$ROOT_TO_PROJDIR = "app"
qrex
config {{ "Debug|x64" }}
subproj {{ {subprojects} }}
{{ "src" {{ "app.cpp" }} }}
"""
    return result


def outputs(folder):
    """Path to content of what the runs wrote: identifiers numbered as they come, dependency files without their times."""
    contents, identifiers = {}, {}
    number = lambda match: b"ID%d" % identifiers.setdefault(match.group(0), len(identifiers))
    for path in sorted(folder.rglob("*")):
        name = str(path.relative_to(folder))
        if not path.is_file() or name.startswith("tree/") or name == "all.qrex":
            continue
        content = path.read_bytes()
        if name == "projects.guids" or name.endswith((".qrexdep", ".o", ".a", "app")):
            content = b"" if content else b"empty"
        contents[name] = re.sub(rb"\{[0-9A-F-]{36}\}", number, content)
    return contents


def steady(workspace, arguments):
    """A complete run has left nothing to write for another one."""
    before = workspace.times("**/*")
    workspace.run("all.qrex", *arguments)
    noted = [name for name in workspace.changed(before, "**/*")
             if workspace.path(name).is_file() and not name.endswith((".qrexdep", "projects.guids"))]
    assert not noted, f"a second run wrote {noted}"


def killed_runs(binary, arguments, check=lambda workspace: None):
    with Workspace(binary, files()) as undisturbed:
        begin = time.monotonic()
        undisturbed.run("all.qrex", *arguments)
        duration = time.monotonic() - begin
        expected = outputs(undisturbed.folder)
        steady(undisturbed, arguments)
    chance = random.Random(20)
    for _ in range(ROUNDS):
        with Workspace(binary, files()) as workspace:
            for _ in range(chance.choice([1, 1, 2, 3])):  # killed again in the run that mends
                delay = chance.uniform(0, duration)
                process = subprocess.Popen([binary, "all.qrex", *arguments], cwd=workspace.folder, start_new_session=True,
                                           stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
                time.sleep(delay)
                chance.choice([os.kill, os.killpg])(process.pid, chance.choice(SIGNALS))
                process.wait()
                torn = [name for name, content in outputs(workspace.folder).items() if name.startswith(WHOLE)
                        and not name.endswith((".part", ".notes")) and content != expected[name]]
                assert not torn, f"killed after {delay:.3f} s: {torn} are half-written"
            workspace.run("all.qrex", *arguments)
            got = outputs(workspace.folder)
            of_ar = re.compile(r"out/lib/.*/st\w{6}$")  # the librarian's own temporary file
            leftovers = {name for name in got if name not in expected and not of_ar.match(name)}
            assert not leftovers, f"killed after {delay:.3f} s: left behind {leftovers}"
            differing = [name for name in expected if got.get(name) != expected[name]]
            assert not differing, f"killed after {delay:.3f} s: {differing} differ"
            steady(workspace, arguments)
            check(workspace)


def gen_visual_studio(binary):
    killed_runs(binary, ["mode=gen", "compiler=vc14"])


def gen_gcc(binary):
    killed_runs(binary, ["mode=gen", "compiler=gcc"])


def translate(binary):
    killed_runs(binary, ["mode=build", "compiler=gcc", "translateOnly=true"])


def build(binary):
    need("g++", "ar")
    killed_runs(binary, ["mode=build", "compiler=gcc"], lambda workspace: workspace.shell("out/lib/x64/Debug/app"))


run_tests([gen_visual_studio, gen_gcc, translate, build])
