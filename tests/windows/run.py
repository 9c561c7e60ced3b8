#!/usr/bin/env python3
"""Runs the tests of the Windows program: run.py BUILD_FOLDER LINUX_BINARY [FOLDER_OF_CASES]

Each group prints how many passed, failed and were skipped, and why. The status is 1 if any failed."""

import os
import re
import shutil
import subprocess
import sys
import tempfile
import time
from concurrent.futures import ThreadPoolExecutor
from pathlib import Path

import compiled
from bridges import Bridges
from common import ROOT, WINE, WRAPPER, Count, run, text_of

SYSTEM_LIBRARIES = {"kernel32.dll", "msvcrt.dll"}
LONG = 20  # seconds, beyond which it is told what a test took
# What cannot pass under Wine, with the reason: single tests, whole scripts, cases.
KNOWN = dict(line.split(None, 1) for line in (ROOT / "tests/windows/skipped.txt").read_text().splitlines()
             if line and not line.startswith("#"))


def units(build):
    count = Count("unit tests")
    known = [label for label in KNOWN if re.fullmatch(r"\w+Test\.\w+", label)]
    for label in known:
        count.skip(label, KNOWN[label])
    met = set()
    for program in sorted(build.glob("*_tests.exe")):
        text = text_of(run([WINE, str(program), "--gtest_filter=-" + ":".join(known)], cwd=build))
        for label in re.findall(r"^\[       OK \] (\S+)", text, re.M):
            count.take(label, None)
            met.add(label)
        for label in dict.fromkeys(re.findall(r"^\[  FAILED  \] ([\w/]+\.[\w/]+)", text, re.M)):
            count.take(label, text[-3000:])
        for label in dict.fromkeys(re.findall(r"^\[  SKIPPED \] ([\w/]+\.[\w/]+) \(", text, re.M)):
            count.skip(label, "no python27.dll")
        if not re.search(r"^\[==========\] \d+ tests? from .* ran", text, re.M):
            count.take(program.name, "It did not come to its end:\n" + text[-3000:])
    for source in sorted((ROOT / "tests").glob("*/posix/*_test.cpp")):
        labels = {".".join(names) for names in re.findall(r"^TEST(?:_F)?\((\w+), (\w+)\)", source.read_text(), re.M)}
        for label in sorted(labels - met):  # most have their like for Windows
            count.skip(label, "of POSIX: shell scripts, pipes and limits in the file system")
    return count


def programs(build):
    count = Count("the programs")
    for name in ("Qrex.exe", "qrex-lsp.exe"):
        told = run(["x86_64-w64-mingw32-objdump", "-p", str(build / name)]).stdout.decode()
        others = set(library.lower() for library in re.findall(r"DLL Name: (\S+)", told)) - SYSTEM_LIBRARIES
        count.take(f"libraries of {name}", f"It needs {others}" if others else None)
    return count


def bytes_of_both(binary):
    count = Count("the same bytes as the binary of this system")
    text = text_of(run([str(ROOT / "tests/windows/bytes.py"), binary, WRAPPER]))
    found = re.search(r"^(\d+) passed, (\d+) failed$", text, re.M)
    count.passed = int(found[1]) if found else 0
    if not found or found[2] != "0":
        count.take("bytes.py", text)
    return count


SETTINGS = """virtualTree = { "tree" } workspaces = { "all.qrws" } config = "Debug" platform = "x64"
$EXPORT_LIB = "out/lib" $EXPORT_TRANSLATED_INCLUDE = "out/include" $EXPORT_UNTRANSLATED_INCLUDE = "out/source" systemName = "Windows"
PATH("x64") = { "tools" "C:/windows/system32" } INCLUDE("x64") = { "C:/include" } LIB("x64") = { "C:/lib" }
"""


class Tree:
    """A workspace of so many sources, whose tools are stood for."""

    def __init__(self, build, sources):
        self.folder = Path(tempfile.mkdtemp(prefix="windows-"))
        source = self.folder / "tree/app/src"
        source.mkdir(parents=True)
        names = ["app.cpp", *(f"s{number}.cpp" for number in range(1, sources))]
        for name in names:
            (source / name).write_text("int x;\n")
        listed = " ".join(f'"{name}"' for name in names)
        (source / "app.qrpj").write_text('$TARGET_TYPE = "Console Application"\n$ROOT_TO_PROJDIR = "app"\n'
                                         f'config {{ "Debug|x64" }}\nqrex {{ "src" {{ {listed} }} }}\n')
        (self.folder / "tree/all.qrws").write_text('"all" { "app" }\n')
        (self.folder / "all.qrex").write_text(SETTINGS)
        tools = self.folder / "tools"
        tools.mkdir()
        for tool in ("cl", "link", "lib", "mt", "rc", "gcc-4", "g++"):
            shutil.copy(build / "stand_in.exe", tools / f"{tool}.exe")
        (tools / "link.exe.script").write_text("touch out/lib/x64/Debug/app.exe\n")
        (tools / "g++.exe.script").write_text("touch out/lib/x64/Debug/app\n")

    def __enter__(self):
        return self

    def __exit__(self, *_):
        shutil.rmtree(self.folder, ignore_errors=True)

    def calls(self, begin):
        path = self.folder / "log"
        text = path.read_text(errors="replace") if path.exists() else ""
        return sum(line.startswith(begin) for line in text.splitlines())


def visual_studio(build):
    with Tree(build, 3) as tree:
        text = text_of(run([WRAPPER, "all.qrex", "compiler=vc14"], cwd=tree.folder))
        calls = [tree.calls(begin) for begin in ("cl /c @", "link.exe @", "mt.exe @")]
        isMarked = (tree.folder / "x64/Debug/app/mt.dep").exists()  # by a batch file, which cmd runs
        isDone = "\nCompleted.." in text and calls == [3, 1, 1] and isMarked
        return None if isDone else f"{calls} calls\n{text[-3000:]}"


# A hundred compilers at once, each of which takes a while; then what links.
def many_tools(build):
    with Tree(build, 100) as tree:
        (tree.folder / "tools/gcc-4.exe.script").write_text("sleep 20000\n")
        begin = time.time()
        text = text_of(run([WRAPPER, "all.qrex", "compiler=gcc", "jobs=100"], cwd=tree.folder))
        calls = [tree.calls(begin) for begin in ("gcc-4 -c @", "g++ @")]
        areTogether = time.time() - begin < 200  # one after the other they would take 2000 seconds
        return None if "\nCompleted.." in text and calls == [100, 1] and areTogether else f"{calls} calls\n{text[-3000:]}"


def processes_in(folder):
    found = []
    for entry in Path("/proc").glob("[0-9]*"):
        try:
            if os.readlink(entry / "cwd") == str(folder) and "wineserver" not in (entry / "cmdline").read_text():
                found.append(int(entry.name))
        except OSError:
            pass
    return found


# A run that is killed leaves no compiler behind.
def killed_run(build):
    with Tree(build, 4) as tree:
        (tree.folder / "tools/gcc-4.exe.script").write_text("sleep 60000\n")
        started = subprocess.Popen([WRAPPER, "all.qrex", "compiler=gcc", "jobs=3"], cwd=tree.folder, stdin=subprocess.DEVNULL,
                                   stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
        for _ in range(600):
            if tree.calls("gcc-4 -c @") == 3:
                break
            time.sleep(0.1)
        before = processes_in(tree.folder)
        started.kill()
        started.wait()
        left = before
        for _ in range(100):
            left = processes_in(tree.folder)
            if not left:
                break
            time.sleep(0.1)
        return None if len(before) >= 4 and not left else f"before: {before}, left: {left}"


def builds(build):
    count = Count("builds with tools that are stood for")
    for test in (visual_studio, many_tools, killed_run):
        count.take(test.__name__, test(build))
    return count


def tests_of(script):
    return re.findall(r"^def (test_\w+)", script.read_text(), re.M)


def side_by_side(count, play, labels):
    """As many at once as there are processors; what cannot pass is not tried, what lacks something here says so."""
    def play_unless_known(label):
        reason = KNOWN.get(label) or KNOWN.get(label.partition(".")[0])
        if reason:
            return label, reason, None
        begin = time.monotonic()
        told = play(label)
        if time.monotonic() - begin > LONG:
            print(f"{label} took {time.monotonic() - begin:.0f} s", flush=True)
        return label, *told
    failures = {}
    with ThreadPoolExecutor(os.cpu_count()) as pool:
        for label, reason, failure in pool.map(play_unless_known, labels):
            if reason:
                count.skip(label, reason)
            elif failure is None:
                count.take(label, None)
            else:
                failures[label] = failure
    for label, failure in failures.items():  # when nothing else runs
        count.take_or_try_again(label, failure, lambda label=label: play(label)[1])
    return count


def play_test(label, program):
    name, test = label.split(".")
    text = text_of(run([sys.executable, str(ROOT / f"tests/endtoend/{name}_test.py"), str(program), test]))
    told = re.search(r"(\d+) passed, 0 failed", text)
    if told and told[1] == "0":
        return text.split("\n")[0], None
    return None, None if told else text[-3000:]


def scripts(program):
    labels = [f"{script.stem.removesuffix('_test')}.{test}" for script in sorted((ROOT / "tests/endtoend").glob("*_test.py"))
              for test in tests_of(script)]
    return side_by_side(Count("end-to-end tests"), lambda label: play_test(label, program), labels)


def cases(folder):
    def play_case(label):
        done = run([sys.executable, str(folder / "run.py"), "--bin", WRAPPER, "--case", label])
        return None, text_of(done) if done.returncode else None
    labels = [str(path.relative_to(folder).with_suffix("")) for path in sorted(folder.rglob("*.case"))]
    return side_by_side(Count("cases"), play_case, labels)


def timed(group):
    begin = time.monotonic()
    count = group()
    count.end(time.monotonic() - begin)
    return count


def main():
    build, binary = Path(sys.argv[1]).resolve(), os.path.abspath(sys.argv[2])
    os.environ.update(QREX_EXE=str(build / "Qrex.exe"), WINEDEBUG="-all")
    folder = sys.argv[3] if len(sys.argv) > 3 else ""
    groups = [lambda: programs(build), lambda: units(build), lambda: bytes_of_both(binary), compiled.examples, compiled.runtime,
              lambda: builds(build)]
    if folder:
        groups.append(lambda: cases(Path(folder).resolve()))
    with Bridges(build, Path(binary).parent) as bridges, ThreadPoolExecutor(1) as pool:
        longest = pool.submit(timed, lambda: scripts(bridges.program))  # takes as long as all others together
        counts = [*map(timed, groups), longest.result()]
    met = {name for count in counts for label in count.skipped for name in (label, label.partition(".")[0])}
    gone = [label for label in KNOWN if label not in met and (folder or "/" not in label)]
    print("".join(f"FAILED skipped.txt: there is no {label}\n" for label in gone), end="")
    total = [sum(part) for part in zip(*((c.passed, len(c.failed), len(c.skipped)) for c in counts))]
    print(f"{total[0]} passed, {total[1]} failed, {total[2]} skipped: {100 * sum(total[:2]) // sum(total)} % were run")
    sys.exit(1 if total[1] or gone else 0)


if __name__ == "__main__":
    main()
