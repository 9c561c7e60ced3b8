#!/usr/bin/env python3
"""What a build leaves to be looked at: the trace."""

import json
import os
import re
import signal
import subprocess
import sys
import time
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import SETTINGS, equal, holds, in_workspace, lacks, run_tests  # noqa: E402

# Takes as long as the source says, and prints a warning or an error where it says so.
COMPILER = r"""#!/bin/bash
rsp=${2#@}; read -r text < "$rsp"
object=${text#*-o \"}; object=${object%%\"*}; source=${text##* \"}; source=${source%\"*}
seconds=$(sed -n 's/.*slow \([0-9.]*\).*/\1/p' "$source"); sleep "${seconds:-0}"
grep -n warned "$source" | sed "s|^\([0-9]*\):.*|$source:\1:5: warning: odd <b>bold</b>|" >&2
if grep -q wrong "$source"; then echo "$source:1:5: error: bad" >&2; exit 1; fi
if grep -q mute "$source"; then exit 3; fi
cp "$source" "$object"
"""
ARCHIVER = '#!/bin/sh\ncat $(tr -d \'"\' < "${3#@}") > "$2"\n'
LINKER = '#!/bin/sh\nsleep 0.1; : > out/lib/x64/Debug/app\n'
PROJECT = '$TARGET_TYPE = "%s"\n$ROOT_TO_PROJDIR = "%s"\nconfig { "Debug|x64" }\nqrex\n%s{ %s "src" { %s } }\n'
FILES = {
    "all.qrex": SETTINGS + "jobs = 2\n", "tree/.qrwsroot": "", "tree/all.qrws": '"all" { "core" "app" }\n',
    "tools/gcc-4": COMPILER, "tools/ar": ARCHIVER, "tools/g++": LINKER,
    "tree/core/src/core.qrpj": PROJECT % ("Static Library", "core", "", '"c.h"', '"one.cpp" "two.cpp" "core.cpp"'),
    "tree/core/c.h": "$enum+ E { e1 };\n",
    "tree/core/src/one.cpp": '@import "core/c.h"\nint one;  // slow 0.3\n',
    "tree/core/src/two.cpp": '@import "core/c.h"\nint two;  // slow 0.2, warned\n',
    "tree/core/src/core.cpp": "int core;\n",
    "tree/app/src/app.qrpj": PROJECT % ("Console Application", "app", 'subproj { "core" }\n', "", '"app.cpp"'),
    "tree/app/src/app.cpp": '@import "core/c.h"\nint main() {}\n',
}
TRACE = 'buildTrace="out/trace.json"'


def spans(workspace):
    """Of the trace: by what each is about and its category, begin and end in milliseconds, slot, arguments."""
    events = json.loads(workspace.path("out/trace.json").read_text())["traceEvents"]
    names = {event["tid"]: event["args"]["name"] for event in events if event["ph"] == "M"}
    found = {}
    for event in events:
        if event["ph"] == "X":
            begin = event["ts"] / 1000
            found[event["name"], event["cat"]] = (begin, begin + event["dur"] / 1000, names[event["tid"]], event["args"])
    return found


def compiled(workspace):
    return {name: span[3].get("why") for (name, category), span in spans(workspace).items() if category == "compiler"}


@in_workspace(FILES)
def test_trace_tells_what_ran_when_and_why(workspace):
    piped = workspace.run("all.qrex")
    workspace.shell("rm -rf x64 out qrexsource")
    log = workspace.run("all.qrex", TRACE)
    equal(*(re.sub(r"\.{3,} *[\d.]+ ms|argv.*\n", "", text) for text in (log, piped)))
    found = spans(workspace)
    one, two = (found[f"core/src/{name}.cpp", "compiler"] for name in ("one", "two"))
    assert 300 <= one[1] - one[0] < 600 and two[0] < one[1] and {one[2], two[2]} == {"slot 1", "slot 2"}, found
    archive, link = found["out/lib/x64/Debug/libcore.a", "linker"], found["out/lib/x64/Debug/app", "linker"]
    assert one[1] <= archive[0] and archive[1] <= link[0], found
    equal(link[3], {"project": "app", "output": "out/lib/x64/Debug/app", "why": "it was missing"})
    time.sleep(0.02)
    workspace.write("tree/core/c.h", "$enum+ E { e1, e2 };\n")
    workspace.run("all.qrex", TRACE)
    equal(compiled(workspace), dict.fromkeys(("core/src/one.cpp", "core/src/two.cpp", "app/src/app.cpp"), "tree/core/c.h was newer"))
    workspace.run("all.qrex", TRACE)
    equal(spans(workspace), {})


@in_workspace(FILES)
def test_trace_of_a_run_that_fails(workspace):
    workspace.write("tree/core/src/one.cpp", "wrong\n")
    workspace.run("all.qrex", TRACE)
    equal(spans(workspace)["core/src/one.cpp", "compiler"][3]["failed"], True)
    workspace.write("tree/app/src/app.cpp", "$class+ Broken {\n")
    workspace.run("all.qrex", TRACE, status=1)
    equal(list(compiled(workspace)), ["core/src/one.cpp"])
    workspace.write("tree/core/src/one.cpp", "slow 30\n")
    with subprocess.Popen([workspace.binary, "all.qrex", TRACE], cwd=workspace.folder, stdout=subprocess.PIPE, text=True,
                          start_new_session=True) as run:
        while not workspace.path("x64/Debug/core/one.o.rsp").exists():
            time.sleep(0.01)
        os.killpg(run.pid, signal.SIGINT)
        holds(run.communicate(timeout=60)[0], "Interrupted")
    holds(str(spans(workspace)), "core/src/one.cpp")


@in_workspace(FILES)
def test_files_that_cannot_be_written(workspace):
    workspace.write("file", "")
    holds(workspace.run("all.qrex", 'buildTrace="file/trace.json"', status=1),
          "Error: File error (file/trace.json)", "Completed with 1 warnings")
    lacks(workspace.run("all.qrex", TRACE, "mode=clean"), "trace.json\n")
    assert not workspace.path("out/trace.json").exists()


run_tests([test_trace_tells_what_ran_when_and_why, test_trace_of_a_run_that_fails, test_files_that_cannot_be_written])
