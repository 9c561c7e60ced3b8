#!/usr/bin/env python3
"""Runs the tests of the Windows program: run.py BUILD_FOLDER LINUX_BINARY [FOLDER_OF_CASES]

Each group prints how many passed, failed and were skipped, and why. The status is 1 if any failed."""

import os
import re
import shutil
import subprocess
import sys
import tempfile
from concurrent.futures import ThreadPoolExecutor
from pathlib import Path

ROOT = Path(__file__).resolve().parents[2]
WINE = "/usr/lib/wine/wine64"
WRAPPER = str(ROOT / "tests/windows/Qrex")
SYSTEM_LIBRARIES = {"kernel32.dll", "msvcrt.dll", "rpcrt4.dll", "shell32.dll"}
# End-to-end scripts that need no compiler or shell in the run itself.
SCRIPTS = ["messages", "generators", "depfile", "questions", "init", "hints", "report"]
# What cannot pass under Wine, with the reason.
KNOWN = dict(line.split(None, 1) for line in (ROOT / "tests/windows/skipped.txt").read_text().splitlines()
             if line and not line.startswith("#"))


class Count:
    def __init__(self, name):
        self.name, self.passed, self.failed, self.skipped = name, 0, [], []

    def take(self, label, failure):
        if failure is None:
            self.passed += 1
        else:
            self.failed.append(label)
            print(f"FAILED {label}\n{failure}", flush=True)

    def skip(self, label, reason):
        self.skipped.append(label)
        print(f"skipped {label}: {reason}", flush=True)

    def end(self):
        print(f"== {self.name}: {self.passed} passed, {len(self.failed)} failed, {len(self.skipped)} skipped", flush=True)


def run(command, **options):
    return subprocess.run(command, stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, timeout=590,
                          **options)


def text_of(done):
    return done.stdout.decode(errors="replace").replace("\r", "")


def units(build):
    count = Count("unit tests")
    for program in sorted(build.glob("*_tests.exe")):
        text = text_of(run([WINE, str(program)], cwd=build))
        for label in re.findall(r"^\[       OK \] (\S+)", text, re.M):
            count.take(label, None)
        for label in dict.fromkeys(re.findall(r"^\[  FAILED  \] ([\w/]+\.[\w/]+)", text, re.M)):
            count.take(label, text[-3000:])
        for label in dict.fromkeys(re.findall(r"^\[  SKIPPED \] ([\w/]+\.[\w/]+) \(", text, re.M)):
            count.skip(label, "no python27.dll")
        if not re.search(r"^\[==========\] \d+ tests? from .* ran", text, re.M):
            count.take(program.name, "It did not come to its end:\n" + text[-3000:])
    for source in sorted((ROOT / "tests").glob("*/posix/*_test.cpp")):
        for label in re.findall(r"^TEST(?:_F)?\((\w+, \w+)\)", source.read_text(), re.M):
            count.skip(label.replace(", ", "."), "of POSIX: shell scripts, pipes and limits in the file system")
    return count


def program(build):
    count = Count("the program")
    told = run(["x86_64-w64-mingw32-objdump", "-p", str(build / "Qrex.exe")]).stdout.decode()
    others = set(name.lower() for name in re.findall(r"DLL Name: (\S+)", told)) - SYSTEM_LIBRARIES
    count.take("libraries", f"It needs {others}" if others else None)
    return count


def bytes_of_both(binary):
    count = Count("the same bytes as the binary of this system")
    text = text_of(run([str(ROOT / "tests/windows/bytes.py"), binary, WRAPPER]))
    found = re.search(r"^(\d+) passed, (\d+) failed$", text, re.M)
    count.passed = int(found[1]) if found else 0
    if not found or found[2] != "0":
        count.take("bytes.py", text)
    return count


# What the tour and its runtime become is compiled for Windows, and runs.
def tour():
    count = Count("an example compiled for Windows")
    folder = Path(tempfile.mkdtemp(prefix="tour-"))
    try:
        shutil.copytree(ROOT / "examples/tour", folder / "examples/tour")
        shutil.copytree(ROOT / "runtime", folder / "runtime")
        place = folder / "examples/tour"
        done = run([WRAPPER, "tour.qrex", "translateOnly=true"], cwd=place)
        failure = text_of(done) if done.returncode else None
        if not failure:
            failure = compiled(place)
        count.take("tour", failure)
    finally:
        shutil.rmtree(folder, ignore_errors=True)
    return count


def compiled(place):
    translated = place / "qrexsource/x64/Debug"
    sources = [path for path in sorted(translated.rglob("*.cpp"))]
    includes = [f"-I{folder}" for folder in [translated, *sorted(path for path in translated.rglob("*") if path.is_dir())]]
    compiler = ["x86_64-w64-mingw32-g++-posix", "-std=c++17", "-O0", "-w", *includes]

    def compile_one(source):
        return run([*compiler, "-c", str(source), "-o", str(source) + ".o"], cwd=place)
    with ThreadPoolExecutor(2) as pool:
        for done in pool.map(compile_one, sources):
            if done.returncode:
                return text_of(done)[:3000]
    done = run([*compiler, "-static", *[f"{source}.o" for source in sources], "-lws2_32", "-o", "app.exe"], cwd=place)
    if done.returncode:
        return text_of(done)[:3000]
    got, expected = text_of(run([WINE, "app.exe"], cwd=place)), (place / "expected.txt").read_text()
    return None if got == expected else f"got\n{got}\nnot\n{expected}"


def scripts():
    count = Count("end-to-end tests")
    for name in SCRIPTS:
        script = ROOT / f"tests/endtoend/{name}_test.py"
        tests = re.search(r"run_tests\(\[?(.*?)\]?\)\s*$", script.read_text(), re.S)
        names = re.findall(r"\w+", tests[1])
        for test in names:
            label = f"{name}.{test}"
            if label in KNOWN:
                count.skip(label, KNOWN[label])
                continue
            done = run([sys.executable, str(script), WRAPPER, test])
            told = re.search(r"(\d+) passed, 0 failed", text_of(done))
            if told and told[1] == "0":
                count.skip(label, text_of(done).split("\n")[0])
            else:
                count.take(label, None if told else text_of(done)[-3000:])
    return count


def cases(folder):
    count = Count("cases")

    def play(path):
        label = str(path.relative_to(folder).with_suffix(""))
        text = path.read_text(errors="replace")
        if label in KNOWN:
            return label, KNOWN[label], None
        if "#!/bin/sh" in text or "#!/bin/bash" in text:
            return label, "its tools are shell scripts", None
        if re.search(r"@(run|eval)?python", text):
            return label, "no python27.dll", None
        done = run([sys.executable, str(folder / "run.py"), "--bin", WRAPPER, "--case", label])
        return label, None, text_of(done) if done.returncode else ""
    with ThreadPoolExecutor(2) as pool:
        for label, reason, failure in pool.map(play, sorted(folder.rglob("*.case"))):
            if reason:
                count.skip(label, reason)
            else:
                count.take(label, failure or None)
    return count


def main():
    build, binary = Path(sys.argv[1]).resolve(), os.path.abspath(sys.argv[2])
    os.environ.update(QREX_EXE=str(build / "Qrex.exe"), WINEDEBUG="-all")
    groups = [lambda: program(build), lambda: units(build), lambda: bytes_of_both(binary), tour, scripts]
    if len(sys.argv) > 3 and sys.argv[3]:
        groups.append(lambda: cases(Path(sys.argv[3]).resolve()))
    counts = []
    for group in groups:
        counts.append(group())
        counts[-1].end()
    total = [sum(part) for part in zip(*((c.passed, len(c.failed), len(c.skipped)) for c in counts))]
    print(f"{total[0]} passed, {total[1]} failed, {total[2]} skipped")
    sys.exit(1 if total[1] else 0)


if __name__ == "__main__":
    main()
