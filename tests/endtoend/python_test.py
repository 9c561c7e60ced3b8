"""Runs of the tool that use Python, and runs that must not need it."""
import os
import re
import subprocess
import sys
import tempfile

BINARY = os.path.abspath(sys.argv[1])
DOCS = os.path.join(os.path.dirname(__file__), "..", "..", "docs", "python.md")
passed = failed = skipped = 0

CONFIG = """virtualTree = { "." }
$EXPORT_LIB = "out/lib"
$EXPORT_TRANSLATED_INCLUDE = "out/include"
$EXPORT_UNTRANSLATED_INCLUDE = "out/source"
workspaces = { "app" }
config = "Debug"
platform = "x64"
compiler = gcc
translateOnly = true
"""
PROJECT = """$TARGET_TYPE = "Application"
$ROOT_TO_PROJDIR = "app"
qrex
config { "Debug|x64" }
{ "src" { %s } }
"""


def translate(files, python=None):
    """The run's status, its output, and the generated text of each file."""
    with tempfile.TemporaryDirectory() as root:
        os.makedirs(root + "/app/src")
        listed = " ".join('"%s"' % name for name in files if not name.endswith(".csv"))
        sources = dict(files, **{"app.qrpj": PROJECT % listed})
        for name, text in sources.items():
            with open(root + "/app/src/" + name, "w") as file:
                file.write(text)
        for name, text in (("main.qrex", CONFIG), (".qrwsroot", "")):
            with open(root + "/" + name, "w") as file:
                file.write(text)
        environment = {key: value for key, value in os.environ.items() if key != "QREX_PYTHON"}
        if python:
            environment["QREX_PYTHON"] = python
        run = subprocess.run([BINARY, "main.qrex"], cwd=root, env=environment, capture_output=True, text=True, timeout=60)
        generated = {}
        for name in files:
            path = root + "/qrexsource/x64/Debug/app/src/" + name
            if os.path.exists(path):
                generated[name] = open(path).read()
        return run.returncode, run.stdout, generated


def check(name, holds, seen):
    global passed, failed
    if holds:
        passed += 1
    else:
        failed += 1
        print("FAILED", name, "\n", seen)


def blocks_of_docs():
    text = open(DOCS).read()
    return [re.sub(r"(?m)^    ", "", block) for block in re.findall(r"(?m)(?:^    .*\n)+", text)]


missing = "/nonexistent/libpython.so"
status, output, _ = translate({"t.py": "@runpython { x = 1 }\n"}, missing)
check("a missing library is named", status == 1 and re.search(
    r"app/src/t\.py\(1\) : error : Python initialisation error: Python 2\.7 can't be loaded; tried\n +" + missing, output),
    output)
status, output, _ = translate({"t.py": "@assertfails(@runpython { x = 1 })\n@runpython { x = 2 }\n"}, missing)
check("a second attempt fails as the first", status == 1 and "app/src/t.py(2)" in output, output)
status, output, generated = translate({"t.py": "@runpython { }\ntext\n"}, missing)
check("an empty block needs no Python", status == 0 and generated.get("t.py") == "text\n", output)

status, output, _ = translate({"t.py": "@runpython { x = 1 }\n"})
if "can't be loaded" in output:
    skipped += 1
    print("skipped: no Python 2.7 library was found")
else:
    table, header, expected = blocks_of_docs()
    status, output, generated = translate({"commands.csv": table, "commands.h": header})
    squeezed = re.sub(r"(?m)^ +\n", "", generated.get("commands.h", ""))  # a line that @for leaves blank
    check("the documented example", expected in squeezed, output + str(generated))

    status, output, _ = translate({"t.py": '@print("a")\n@runpython\n{\n    print "b",\n    import sys\n'
                                           '    sys.__stdout__.write("c")\n}\n@print("d")\n'})
    check("prints keep their order", '"a"bc"d"' in output, output)

    status, output, generated = translate({"t.py": "@runpython\n{\n    import sys\n    sys.exit(0)\n}\n"})
    check("exit is an error", status == 1 and "RunPython error: SystemExit: 0\n" in output and not generated, output)

print("%d passed, %d failed, %d skipped" % (passed, failed, skipped))
sys.exit(failed > 0)
