#!/usr/bin/env python3
"""Runs of the tool that use Python, and runs that must not need it."""

import re

from workspace_fixture import ROOT, Skipped, Workspace, equal, holds, indented, project, run_tests, workspace_of

MISSING = "/nonexistent/libpython.so"


def translate(binary, files, status=0, **environment):
    """The run's output, and the generated text of each file."""
    listed = " ".join(f'"{name}"' for name in files if not name.endswith(".csv"))
    described = {"tree/app/src/app.qrpj": project("Application", "app", f'"src" {{ {listed} }}')}
    with Workspace(binary, {**workspace_of("app", settings="translateOnly = true\n"), **described}) as workspace:
        for name, text in files.items():
            workspace.write("tree/app/src/" + name, text)
        output = workspace.run("all.qrex", status=status, **environment)
        generated = {path.name: path.read_text() for path in workspace.folder.glob("qrexsource/x64/Debug/app/src/*")}
        return output, generated


def need_python(binary):
    try:
        translate(binary, {"t.py": "@runpython { x = 1 }\n"})
    except AssertionError as failure:
        if "can't be loaded" in str(failure):
            raise Skipped("Python 2.7")
        raise


def test_a_missing_library_is_named(binary):
    python = {"status": 1, "QREX_PYTHON": MISSING}
    output, _ = translate(binary, {"t.py": "@runpython { x = 1 }\n"}, **python)
    assert re.search(r"app/src/t\.py\(1\) : error : Python initialisation error: Python 2\.7 can't be loaded; tried\n +"
                     + MISSING, output), output
    # A second attempt fails as the first.
    output, _ = translate(binary, {"t.py": "@assertfails(@runpython { x = 1 })\n@runpython { x = 2 }\n"}, **python)
    holds(output, "app/src/t.py(2)")
    # An empty block needs none.
    _, generated = translate(binary, {"t.py": "@runpython { }\ntext\n"}, QREX_PYTHON=MISSING)
    equal(generated, {"t.py": "text\n"})


def test_what_would_end_the_tool_is_an_error(binary):
    need_python(binary)
    for call in ("os._exit(0)", "posix._exit(0)", "os.execl('/bin/true', 'true')"):
        output, generated = translate(binary, {"t.py": f"@runpython {{ import os, posix; {call} }}\n"}, status=1)
        holds(output, "app/src/t.py(1) : error : RunPython error: SystemExit: os.")
        equal(generated, {})
    code = "import os, subprocess; subprocess.check_call(['true']); child = os.fork()\nif not child: os._exit(0)\n"
    _, generated = translate(binary, {"t.py": f"@runpython {{ {code} os.waitpid(child, 0)[1] }}\ntext\n"})
    equal(generated, {"t.py": "text\n"})


def test_the_folder_of_the_run_stays_and_prints_keep_their_order(binary):
    need_python(binary)
    _, generated = translate(binary, {"t.py": "@runpython { import os; os.chdir('/') }\n@defpython go = os.chdir('/usr') or 1\ngo\n",
                                      "u.py": "text\n"})
    equal(generated, {"t.py": "1\n", "u.py": "text\n"})
    output, _ = translate(binary, {"t.py": '@print("a")\n@runpython\n{\n    print "b",\n    import sys\n'
                                           '    sys.__stdout__.write("c")\n}\n@print("d")\n'})
    holds(output, '"a"bc"d"')


def test_the_documented_example(binary):
    need_python(binary)
    table, header, expected = (block for _, block in indented((ROOT / "docs/python.md").read_text()))
    _, generated = translate(binary, {"commands.csv": table, "commands.h": header})
    holds(re.sub(r"(?m)^ +\n", "", generated["commands.h"]), expected)  # without the lines that @for leaves blank


run_tests(globals())
