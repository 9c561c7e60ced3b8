#!/usr/bin/env python3
"""What names, tools, other runs and the system may do to a build: nothing but the tools that it names runs, each run that
calls tools has its folder for itself, and what is in the way is told."""

import os
import signal
import subprocess
import time

from workspace_fixture import DRIVE, SETTINGS, Workspace, equal, holds, in_workspace, lacks, project, run_tests, stand_ins, workspace_of

PROJECT = "tree/app/src/app.qrpj"
FILES = {**workspace_of("app"), "tree/app/src/a.cpp": "int main() { return 0; }\n",
         PROJECT: project("Console Application", "app", '"src" { "a.cpp" }')}


def searching(pattern, **files):
    """The files, whose project takes what is found."""
    return {**FILES, PROJECT: FILES[PROJECT].replace('"a.cpp"', pattern), **files}


# Names that the shell would run, or end a word at; each would leave a file behind.
NAMES = ["$(touch RAN)", "`touch RAN`", "a;touch RAN;b", "a&touch RAN&", "$HOME", "a' b", "a, b", "~", *([] if DRIVE else ["a*"]), "-x", "@x"]


def test_names_do_not_run(binary):
    for name in NAMES:
        settings = SETTINGS.replace('"x64"', f'"{name}"').replace('"Debug"', f'"{name}"').replace("out/lib", name)
        files = {
            "all.qrex": settings + f'virtualTree = {{ "tree {name}" }}\n',
            f"tree {name}/.qrwsroot": "",
            f"tree {name}/all.qrws": f'"all" {{ "{name}" }}\n',
            f"tree {name}/{name}/src/a.cpp": "int main() { return 0; }\n",
            f"tree {name}/{name}/src/{name}.qrpj": FILES[PROJECT].replace("app", name).replace("Debug|x64", f"{name}|{name}"),
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
def test_sources_and_folders_are_names(workspace):
    folder = 'x" -wrapper .,EVIL "y/'
    names = ["a\\b.cpp", "a b.cpp", "a'b.cpp", "-x.cpp", "@x.cpp", "#a.cpp", "$(touch RAN).cpp"]
    sources = {f"tree/app/src/{name}": f"int Named{number};\n" for number, name in enumerate(names)}
    library = project("Dynamic-Link Library", "app", '"src" { "*.cpp" }', "+cpp { -fPIC }")
    for name, text in {**FILES, PROJECT: library, **sources}.items():
        workspace.write(folder + name, text)
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


def test_a_quote_in_a_name_is_refused(binary):
    plain = FILES[PROJECT]
    changes = [("tree/all.qrws", '"all" { "a\\"pp" }\n', 'tree/all.qrws(1) : ', '"a\\"pp"'),
               (PROJECT, plain.replace("Debug", 'De\\"bug'), "app.qrpj(3) : ", '"De\\"bug|x64"'),
               (PROJECT, plain.replace('"a.cpp"', '"a.cpp" as "a\\"a.cpp"'), "app.qrpj(6) : ", '"a\\"a.cpp"')]
    for line, name in (('config = ', '"De\\"bug"'), ('$TARGET_DIR = ', '"De\\"bug/x64"'), ('virtualTree = ', '{ "tr\\"ee" }')):
        changes.append(("all.qrex", SETTINGS + line + name + "\n", "all.qrex(13) : ", name.strip("{ }")))
    for path, text, place, name in changes:
        with Workspace(binary, {**FILES, path: text}) as workspace:
            holds(workspace.run("all.qrex", status=1), place + "A double quote can't stand in " + name)
    if DRIVE:  # no file has such a name
        return
    with Workspace(binary, searching('"*.cpp"', **{'tree/app/src/b"b.cpp': ""})) as workspace:
        holds(workspace.run("all.qrex", status=1), "A double quote can't stand in app/src/b\"b.cpp")


SLOW_COMPILER = """#!/bin/sh
[ -e busy ] && echo "a.cpp:1: error: not alone"
touch busy; sleep 0.3; rm busy
exec g++ "$@"
"""


@in_workspace({**FILES, "tools/gcc-4": SLOW_COMPILER}, "g++")
def test_builds_in_one_folder_follow_each_other(workspace):
    first = subprocess.Popen([workspace.binary, "all.qrex"], cwd=workspace.folder, stdout=subprocess.PIPE, text=True)
    while not workspace.path("busy").exists():
        assert first.poll() is None, first.stdout.read()
        time.sleep(0.01)
    other = "another process" if DRIVE else f"process {first.pid}"
    holds(workspace.run("all.qrex"), f"Waiting for {other}, which builds in this folder\n", "\nCompleted..")
    lacks(first.communicate()[0], "error")
    assert first.returncode == 0
    lacks(workspace.run("all.qrex", "translateOnly=true"), "Waiting")


TARGET = "out/lib/x64/Debug/app"


@in_workspace({**FILES, **stand_ins(), "x64/Debug/app/compiler.rsp": "", "out1.txt": ""})
def test_what_others_have_left(workspace):
    """Files of ours that nobody may read, and a parent that ignores the end of children."""
    for name in ("x64/Debug/app/compiler.rsp", "out1.txt"):
        workspace.path(name).chmod(0)
    done = subprocess.run([workspace.binary, "all.qrex"], cwd=workspace.folder, stdout=subprocess.PIPE, text=True,
                          preexec_fn=lambda: signal.signal(signal.SIGCHLD, signal.SIG_IGN))
    holds(done.stdout, "\nCompleted..")
    lacks(done.stdout, "ode : ")
    assert workspace.path(TARGET).exists()
    assert not workspace.path("out1.txt").exists() and not workspace.path("x64/Debug/app/compiler.rsp").exists()


@in_workspace({**FILES, **stand_ins()})
def test_a_clock_that_was_ahead(workspace):
    workspace.run("all.qrex")
    workspace.shell("find x64 out/lib -type f -exec touch -d '1 hour' {} +")
    workspace.append("tree/app/src/a.cpp", "int edited;\n")
    workspace.run("all.qrex")
    holds(workspace.path(TARGET).read_text(), "int edited;")
    before = workspace.times("**/*")
    workspace.run("all.qrex")
    assert not [name for name in workspace.changed(before, "**/*") if name.endswith((".o", "/app"))], "nothing is left to do"


@in_workspace({**FILES, "tools/gcc-4": '#!/bin/sh\necho "a.cpp:1: warning: $LC_ALL"\n'})
def test_tools_speak_english(workspace):
    holds(workspace.run("all.qrex", LC_ALL="de_DE.UTF-8"), "warning: C\n")


@in_workspace({**FILES, "tree/app/src/a.cpp": "int broken\n" + "//\n" * 4000})
def test_writes_beyond_the_limit_of_file_sizes_fail(workspace):
    output = workspace.shell("ulimit -f 8; exec Qrex all.qrex", status=1)
    holds(output, "Error: File error (qrexsource/x64/Debug/app/src/a.cpp) : The file size exceeds the limit allowed")


IMPORTS = 2000 if DRIVE else 10000  # in the folders of Wine each file is searched for


@in_workspace(lambda: searching('"*.h" "a.cpp"', **{
    "tree/app/src/a.cpp": '@import "h0.h"\n', f"tree/app/src/h{IMPORTS}.h": "",
    **{f"tree/app/src/h{i}.h": f'@import "h{i + 1}.h"\n' for i in range(IMPORTS)}}))
def test_a_long_chain_of_imports_works_or_is_refused(workspace):
    limit = "" if DRIVE else "ulimit -v 300000; "
    output = workspace.shell(f"({limit}Qrex all.qrex translateOnly=true) || echo status $?")
    if "status" in output and "AddressSanitizer failed to allocate" not in output:  # whose own memory is above the limit
        holds(output, ".h(1) : error : ", " nested too deeply\n", "status 1\n")
    for _ in range(2):
        holds(workspace.run("all.qrex", "translateOnly=true"), "\nCompleted..")


@in_workspace(searching('"*.cpp"'))
def test_what_a_search_cannot_read_is_told(workspace):
    for name, target in (("gone.cpp", "none"), ("other.txt", "other.txt")):  # what is not there, and is not searched for
        workspace.path(f"tree/app/src/{name}").symlink_to(target)
    workspace.run("all.qrex", "translateOnly=true")
    workspace.path("tree/app/src/loop.cpp").symlink_to("loop.cpp")
    holds(workspace.run("all.qrex", "translateOnly=true", status=1), "app.qrpj(6) : Couldn't read tree/app/src/loop.cpp : ")


@in_workspace({**FILES, "elsewhere": "theirs"}, "g++")
def test_links_are_replaced_and_not_written_through(workspace):
    workspace.run("all.qrex")
    elsewhere = workspace.path("elsewhere")
    elsewhere.chmod(0o444)
    outputs = [workspace.path(name) for name in ("qrexsource/x64/Debug/app/src/a.cpp", "qrexsource/x64/Debug/app.qrexdep",
                                                 "x64/Debug/app/a.o", "out/lib/x64/Debug/app", "out/source/app/src/app.qrpj")]
    for link in (os.link,) if DRIVE else (os.symlink, os.link):
        for output in outputs:
            output.unlink()
            link(elsewhere, output)
        workspace.append("tree/app/src/a.cpp", f"int by_{link.__name__};\n")
        holds(workspace.run("all.qrex"), "\nCompleted..")
        equal((elsewhere.read_text(), elsewhere.stat().st_mode & 0o777), ("theirs", 0o444))
        equal([output for output in outputs if output.is_symlink() or output.samefile(elsewhere)], [])


run_tests(globals())
