#!/usr/bin/env python3
"""Positions followed between generated text and its sources: by arguments, and as a filter behind other tools."""

import os
import subprocess
import time

from workspace_fixture import DRIVE, equal, holds, in_workspace, lacks, project, run_tests, workspace_of

OUT = "qrexsource/x64/Debug/app/src/"
FILES = {
    **workspace_of("app", settings="translateOnly = true\n"), "tree/app/.keep": "",
    "tree/app/src/app.qrpj": project("Static Library", "app", '"open.h" "src" { "a.h" "app.cpp" "x (1).h" }'),
    "tree/app/open.h": "int open_to_all;\n",
    "tree/app/src/x (1).h": "int x;\nint y;\n",
    "tree/app/src/a.h": "// first\n\n$enum Kind\n{\n  one,\n  two\n};\ninline int twice_as(int unused)\n{\n    return 2;\n}\n",
    "tree/app/src/app.cpp": '@import "a.h"\n\nint main()\n{\n  int local = 1;\n  return 0;\n}\n',
}


def lines_of(workspace, name):
    return workspace.path(name).read_text().splitlines()


def line_with(workspace, name, text):
    return next(number for number, line in enumerate(lines_of(workspace, name), 1) if text in line)


def followed(workspace, option, *positions, **options):
    return workspace.run(option, "all.qrex", *positions, **options).splitlines()


def filtered(workspace, text, option="--where"):
    done = subprocess.run([workspace.binary, option, "all.qrex"], cwd=workspace.folder, input=text, capture_output=True, timeout=100)
    equal(done.returncode, 0)
    return done.stdout


@in_workspace(FILES)
def test_there_and_back(workspace):
    """Each line of a source that is copied comes back; what a declaration gives leads to it. Nothing is written."""
    before = workspace.times("**/*")
    filtered(workspace, f"{OUT}app.cpp:3\n".encode())
    workspace.run("--there", "all.qrex", "tree/app/src/app.cpp:3", status=1)  # it went nowhere yet
    workspace.run("--list", "all.qrex")
    equal(workspace.times("**/*"), before)
    workspace.run("all.qrex")
    before = workspace.times("**/*")
    for name in ("a.h", "app.cpp", "x (1).h"):
        source, output = f"tree/app/src/{name}", OUT + name
        generated = lines_of(workspace, output)
        copied = [n for n, line in enumerate(lines_of(workspace, source), 1)
                  if line and generated.count(line) == 1]
        assert copied, name
        there = followed(workspace, "--there", *(f"{source}:{n}:{1}" for n in copied))
        equal(there, [f"{output}:{generated.index(lines_of(workspace, source)[n - 1]) + 1}:1" for n in copied])
        equal(followed(workspace, "--where", *there), [f"{source}:{n}:1" for n in copied])
    enum = line_with(workspace, OUT + "a.h", "enum ")
    place = followed(workspace, "--where", f"{OUT}a.h:{enum}")[0]
    assert place in {f"tree/app/src/a.h:{n}" for n in range(3, 8)}, place
    equal(followed(workspace, "--where", f"{OUT}a.h:1"), ["tree/app/src/a.h:1"])  # the guard
    equal(workspace.times("**/*"), before)


@in_workspace(FILES)
def test_filter_forms(workspace):
    """All forms of positions, several in a line; whatever else stands there comes out byte for byte."""
    workspace.run("all.qrex")
    folder = DRIVE + str(workspace.folder.resolve())
    at = line_with(workspace, OUT + "app.cpp", "local")
    there, back = f"{OUT}app.cpp", "tree/app/src/app.cpp"
    x = line_with(workspace, OUT + "x (1).h", "int y")
    for line, expected in [
            (f"{there}:{at}:3: warning: unused", f"{back}:5:3: warning: unused"),
            (f"{there}({at}) : error C1: x", f"{back}(5) : error C1: x"),
            (f"{there}({at},3): x", f"{back}(5,3): x"),
            (f"In file included from ./{there}:{at}, from {folder}/{there}:{at}:", f"In file included from {back}:5, from {folder}/{back}:5:"),
            (f"\x1b[1m{there}:{at}:3:\x1b[0m", f"\x1b[1m{back}:5:3:\x1b[0m"),
            (f"at {OUT}../src/app.cpp:{at}", f"at {back}:5"),
            (f"<{OUT}x (1).h:{x}>", "<tree/app/src/x (1).h:2>"),
            ("out/include/app/open.h:5:5: x", "tree/app/open.h:1:5: x"),
            (f"{there}:{at}:3: x\r", f"{back}:5:3: x\r"),
            *((same, same) for same in [
                f"/elsewhere/{there}:{at}:3:", f"my{there}:{at}", f"{there}:99999", f"{there}:0", f"{there}", f"{there}:", f"{there}:x",
                f"{there}:99999999999999999999999", f"{OUT}none.h:3", "qrexsource/x64/Debug/", f"{there}({at}", "a:1:2: b", "",
                f"{OUT}../../../../../../../../etc/passwd:1"])]:
        equal(filtered(workspace, line.encode()), expected.encode())
        equal(filtered(workspace, (line + "\n").encode() * 2), (expected + "\n").encode() * 2)
    junk = bytes(range(256)) * 1000 + b"qrexsource/x64/Debug/app/src/\xff\xfe:1:(" * 1000
    equal(filtered(workspace, junk), junk)
    equal(filtered(workspace, f"{back}:5:3: x\nother/{back}:5\n".encode(), "--there"), f"{there}:{at}:3: x\nother/{back}:5\n".encode())
    many = (f"{there}:5:3: warning: a variable is not used\n" + "  no position\n").encode() * 200_000
    filtered(workspace, many)  # takes a second


@in_workspace(FILES)
def test_stale(workspace):
    """A text is told to be older than its source, or than what that imports; what was not translated, as well."""
    workspace.run("all.qrex")
    at = line_with(workspace, OUT + "app.cpp", "local")
    equal(followed(workspace, "--where", f"{OUT}app.cpp:{at}"), ["tree/app/src/app.cpp:5"])
    time.sleep(0.02)
    workspace.append("tree/app/src/a.h", "// later\n")
    equal(followed(workspace, "--where", f"{OUT}app.cpp:{at}", f"{OUT}x (1).h:5"), ["tree/app/src/app.cpp:5 (stale)", "tree/app/src/x (1).h:1"])
    equal(filtered(workspace, f"{OUT}app.cpp:{at}: x\r\n".encode()), b"tree/app/src/app.cpp:5: x (stale)\r\n")
    equal(followed(workspace, "--there", "tree/app/src/app.cpp:5"), [f"{OUT}app.cpp:{at} (stale)"])
    workspace.run("all.qrex")
    equal(followed(workspace, "--where", f"{OUT}app.cpp:{at}"), ["tree/app/src/app.cpp:5"])
    # With fingerprints, another key and an older source as well.
    prints = ["fingerprints=true", "rebuildAll=true"]
    workspace.run("all.qrex", *prints)
    equal(followed(workspace, "--where", f"{OUT}app.cpp:{at}", prints[0], "modernCpp=true"), ["tree/app/src/app.cpp:5 (stale)"])
    equal(followed(workspace, "--where", f"{OUT}app.cpp:{at}", prints[0]), ["tree/app/src/app.cpp:5"])
    workspace.write("tree/app/src/a.h", "int a;\n")
    os.utime(workspace.path("tree/app/src/a.h"), (1000, 1000))
    equal(followed(workspace, "--where", f"{OUT}app.cpp:{at}", prints[0]), ["tree/app/src/app.cpp:5 (stale)"])


@in_workspace(FILES)
def test_kept_text(workspace):
    """A text that stays, since blanks and comments alone differ, is followed as it is: line by line to where its words stand now.
    Kept maps say the same as a translation in memory, and are left out where they are damaged or of another text."""
    for keys in ((), ("positionMaps=true",)):
        keys = ("writeTokenEquivalent=false", *keys)
        workspace.write("tree/app/src/a.h", FILES["tree/app/src/a.h"])
        workspace.run("all.qrex", "rebuildAll=true", *keys)
        workspace.write("tree/app/src/a.h", "// of\n// more\n\n\n" + FILES["tree/app/src/a.h"].replace("one,", "one,  // the\n // first\n"))
        before = lines_of(workspace, OUT + "a.h")
        workspace.run("all.qrex", *keys)
        equal(lines_of(workspace, OUT + "a.h"), before)
        source = lines_of(workspace, "tree/app/src/a.h")
        there = [line_with(workspace, OUT + "a.h", text) for text in ("twice_as", "return 2")]
        expected = [f"tree/app/src/a.h:{line_with(workspace, 'tree/app/src/a.h', text)}" for text in ("twice_as", "return 2")]
        equal(workspace.run("--where", "all.qrex", *(f"{OUT}a.h:{n}" for n in there), *keys).splitlines(), expected)
    assert len(source) == 17, source
    kept = workspace.path(OUT + "a.h.qrexmap")
    every = [f"{OUT}{name}:{n}" for name in ("a.h", "app.cpp", "x (1).h") for n in range(1, len(lines_of(workspace, OUT + name)) + 1)]
    answers = workspace.run("--where", "all.qrex", *every, *keys)
    lacks(answers, "stale")
    # With the map alone it is so: its source has changed on the way, unnoticed.
    times = workspace.path("tree/app/src/a.h").stat()
    workspace.write("tree/app/src/a.h", "\n" + workspace.path("tree/app/src/a.h").read_text())
    os.utime(workspace.path("tree/app/src/a.h"), ns=(times.st_atime_ns, times.st_mtime_ns))
    equal(workspace.run("--where", "all.qrex", *every, *keys), answers)
    moved = f"tree/app/src/a.h:{int(expected[1].rsplit(':', 1)[1]) + 1}"
    for content in (b"", kept.read_bytes()[:-3], kept.read_bytes()[:40] + b"\xff" * 40, workspace.path(OUT + "app.cpp.qrexmap").read_bytes()):
        kept.write_bytes(content)
        equal(workspace.run("--where", "all.qrex", f"{OUT}a.h:{there[1]}", *keys).strip(), moved)
    workspace.run("all.qrex", "mode=clean", *keys)
    equal(list(workspace.folder.glob("qrexsource/**/*.qrexmap")), [])


@in_workspace(FILES)
def test_errors(workspace):
    workspace.run("all.qrex")
    holds(workspace.run("--where", "all.qrex", "tree/app/src/app.cpp:3", status=1), "Error: tree/app/src/app.cpp:3 is no position in")
    holds(workspace.run("--there", "all.qrex", "none.h:3", status=1), "Error: none.h:3 is no position in a source")
    holds(workspace.run("--where", "none.qrex", "a.h:3", status=1), "none.qrex")
    workspace.write("tree/app/src/app.cpp", "$class {\n")
    holds(workspace.run("--where", "all.qrex", f"{OUT}app.cpp:3", status=1), "tree/app/src/app.cpp(1) : error")
    equal(filtered(workspace, f"{OUT}app.cpp:3\n{OUT}x (1).h:5\n".encode()).decode(), f"{OUT}app.cpp:3\ntree/app/src/x (1).h:1\n")


run_tests(globals())
