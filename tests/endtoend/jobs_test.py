#!/usr/bin/env python3
"""Compilers beside each other: what a run with jobs tells and leaves is what one without does."""

import os
import re
import signal
import subprocess
import time

from workspace_fixture import comparable, contents, equal, holds, in_workspace, lacks, project, run_tests, stand_ins, workspace_of

# Takes the longer the earlier its source comes, so that ends come in another order; notes how many run at once.
COMPILING = """touch "running/$$"; ls running | wc -l >> most; echo half > "$object"
number=${source//[^0-9]/}; number=${number: -1}
sleep "0.$(printf %03d $((30 * (9 - number))))"; rm "running/$$"
case $number in
  2) echo "$source:1:1: warning: two";;
  5) echo "$source:1:1: error: five" >&2; rm "$object"; exit 1;;
  6) kill -ABRT $$;;
esac"""


def library(name, *sources):
    return project("Static Library", name, '"src" { %s }' % " ".join(f'"{source}"' for source in sources))


def files(faulty):
    made = {**workspace_of("good", "bad"), **stand_ins(COMPILING), "running/.keep": ""}
    for name, numbers in (("good", (0, 1, 3, 4, 7)), ("bad", range(8) if faulty else ())):
        sources = [f"{name}{number}.cpp" for number in numbers] + [f"{name}.cpp"]
        made[f"tree/{name}/src/{name}.qrpj"] = library(name, *sources)
        made.update({f"tree/{name}/src/{source}": f"int {source[:-4]};\n" for source in sources})
    return made


def told(text):
    """A log without what has to differ."""
    return re.sub(r"[\w/]*(compiler|\.o)\.rsp", "RSP", comparable(text))


def compare(workspace, *arguments, status=0):
    outcomes = []
    for jobs in ("1", "4", "0"):
        workspace.shell("rm -rf x64 out qrexsource most running/*")
        log = workspace.run("all.qrex", f"jobs={jobs}", *arguments, status=status)
        outcomes.append((told(log), contents(workspace.folder, "x64/**/*", "out/**/*", "qrexsource/**/*.cpp")))
        most = max(map(int, workspace.path("most").read_text().split()))
        assert most == 1 if jobs == "1" else 1 < most <= 4 or jobs == "0", f"{most} at once with {jobs} jobs"
    for outcome in outcomes[1:]:
        equal(outcome, outcomes[0])
    return outcomes[0][0]


@in_workspace(files(True))
def test_log_and_outputs_are_those_of_one_job(workspace):
    log = compare(workspace)
    holds(log, "warning: two", "error: five", "ended by signal 6", "1 warnings, 2 errors")
    compare(workspace, "diagnostics=true")
    compare(workspace, "failOnErrors=true", status=1)


@in_workspace(files(True))
def test_translation_error_behind_running_compilers(workspace):
    workspace.write("tree/bad/src/bad4.cpp", "$class+ Broken {\n")
    holds(compare(workspace, status=1), "warning: two", "bad4.cpp")
    equal(workspace.path("x64/Debug/bad/bad3.o").read_text().strip(), "int bad3;")


# That of `first` writes into a source of the project behind it.
MEDDLING = "case $object in *first.o) echo 'int more;' >> tree/second/src/second.cpp;; esac"


@in_workspace({**workspace_of("first", "second"), **stand_ins(MEDDLING), "tree/first/src/first.cpp": "int first;\n",
               "tree/second/src/second.cpp": "int second;\n", "tree/first/src/first.qrpj": library("first", "first.cpp"),
               "tree/second/src/second.qrpj": library("second", "*.h", "second.cpp"),
               **{f"tree/second/src/h{number}.h": "" for number in range(500)}})
def test_projects_see_what_those_ahead_of_them_have_written(workspace):
    workspace.run("all.qrex")
    for number, change in enumerate(("rm x64/Debug/first/first.o", "echo >> tree/first/src/first.cpp"), 2):
        workspace.shell(change)
        workspace.run("all.qrex")
        equal(workspace.path("x64/Debug/second/second.o").read_text().count("more"), number)


@in_workspace(files(False))
def test_interrupt_leaves_nothing_half_made(workspace):
    for number in (signal.SIGINT, signal.SIGTERM, signal.SIGKILL):
        workspace.shell("rm -rf x64 out qrexsource most running/*")
        with subprocess.Popen([workspace.binary, "all.qrex", "jobs=4"], cwd=workspace.folder, stdout=subprocess.PIPE,
                              start_new_session=True) as run:
            while len(os.listdir(workspace.path("running"))) < 4:
                time.sleep(0.01)
            (os.killpg if number == signal.SIGINT else os.kill)(run.pid, number)
            run.communicate(timeout=60)
        workspace.shell("rm -f running/*")
        lacks(workspace.run("all.qrex", "jobs=4"), "errors")
        objects = [name for name in workspace.times("x64/**/*.o") if "half" in workspace.path(name).read_text()]
        equal((objects, workspace.times("x64/**/*.rsp")), ([], {}))


@in_workspace(files(True))
def test_the_next_project_begins_beside_the_last_one(workspace):
    # A compiler of the first project ends when one of the second has begun; neither is linked ahead of its objects.
    workspace.append("tools/gcc-4", "case $source in *good.cpp) until [ -e begun ]; do sleep 0.01; done;; *bad.cpp) touch begun;; esac\n")
    log = workspace.run("all.qrex", "jobs=2", "diagnostics=true")
    holds(log, "good/good.o.rsp", "ar rcs", "libgood.a", "good....", "bad/bad0.o.rsp")
    holds(workspace.path("out/lib/x64/Debug/libgood.a").read_text(), "int good0;", "int good;")


@in_workspace(files(False), "make")
def test_make_grants_jobs(workspace):
    # With `+` the recipe is given the job server; without it the numbers alone, which lead nowhere.
    workspace.write("Makefile", "granted:\n\t+@Qrex all.qrex jobs=4 > log\nkept:\n\t@Qrex all.qrex jobs=4 > log\n")
    for target, bound in (("granted", 2), ("kept", 4)):
        workspace.shell("rm -rf x64 out qrexsource most running/*")
        lacks(workspace.shell(f"make -j2 {target}"), "jobserver")
        equal(max(map(int, workspace.path("most").read_text().split())), bound)


run_tests(globals())
