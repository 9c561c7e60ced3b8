#!/usr/bin/env python3
"""Lets the system calls of whole runs go wrong, one after the other, and looks at what the runs leave.

campaign.py BINARY [--short] [--markdown] [KIND...]

KIND names a kind of run ("build, 4 jobs"); without one come all, and what is tried of them together. Each row of the table is a kind of run and a kind of fault. For each call of that kind (of `--short`: for some) a fresh
workspace is made and the run is disturbed at that call. What must hold afterwards:
  - the run did not end in a signal, an abort or without an end (but for those that were killed);
  - each file that it writes is as before or as it is to be, never a part of it;
  - where something is missing, the run said so: a line that the undisturbed run does not have;
  - the next run, undisturbed, ends in the end state of an undisturbed run, and leaves nothing to do.
Ends with 1 when a row does not keep this."""

import argparse
import concurrent.futures
import errno
import os
import random
import re
import shutil
import signal
import subprocess
import sys
import tempfile
import time
from pathlib import Path

import layout
import stamps

HERE = Path(__file__).resolve().parent
sys.path.insert(0, str(HERE.parent / "endtoend"))
import signals  # noqa: E402
import workspaces  # noqa: E402
from workspace_fixture import Workspace  # noqa: E402

TRANSLATE = ["mode=build", "compiler=gcc", "translateOnly=true"]
BUILD = ["mode=build", "compiler=gcc"]
JOBS = [*BUILD, "jobs=4", "keepGoing=true", "fingerprints=true", 'launcher={"lead"}']
VISUAL = ["mode=build", "compiler=vc14", "platform=\"Win64\""]
RUNS = {  # name: arguments, and what stands there before
    "translate": (TRANSLATE, None),
    "translate again": (TRANSLATE, TRANSLATE),
    "build": (BUILD, None),
    "build again": (BUILD, BUILD),
    "build, 4 jobs": (JOBS, None),
    "build again, 4 jobs": (JOBS, JOBS),
    "build, vc14": (VISUAL, None),
    "build again, vc14": (VISUAL, VISUAL),
    "gen, gcc": (["mode=gen", "compiler=gcc"], None),
    "gen, vc14": (["mode=gen", "compiler=vc14"], None),
}
FAULTS = [  # call, how, error
    ("open", "fail", errno.EACCES), ("open", "fail", errno.EMFILE), ("read", "fail", errno.EIO),
    ("read", "short", 0), ("read", "fail", errno.EINTR), ("write", "fail", errno.ENOSPC), ("write", "short", 0),
    ("write", "fail", errno.EINTR), ("write", "kill", 0), ("close", "fail", errno.EIO), ("stat", "fail", errno.EIO),
    ("rename", "fail", errno.EIO), ("rename", "kill", 0), ("unlink", "fail", errno.EIO), ("mkdir", "fail", errno.ENOSPC),
    ("chmod", "fail", errno.EPERM), ("chmod", "kill", 0), ("utime", "fail", errno.EPERM), ("utime", "kill", 0),
    ("opendir", "fail", errno.EACCES), ("readdir", "fail", errno.EIO), ("fopen", "fail", errno.EMFILE),
    ("fwrite", "fail", errno.ENOSPC), ("fwrite", "short", 0), ("fflush", "fail", errno.ENOSPC),
    ("fclose", "fail", errno.ENOSPC), ("fork", "fail", errno.EAGAIN), ("send", "fail", errno.EPIPE), ("send", "kill", 0),
    ("recv", "fail", errno.ECONNRESET), ("recv", "kill", 0), ("keeper fork", "fail", errno.EAGAIN),
    ("keeper fork", "kill", 0), ("keeper send", "kill", 0),
]
KEPT = "same end state, a message where something is missing"
INPUTS = ("tree/", "tools/", "all.qrex")
COMBINATIONS = 60  # of several faults, for each kind of run


IDENTIFIER = re.compile(rb"\{?[0-9A-F]{8}-[0-9A-F-]{27}\}?")
HAS_IDENTIFIER = re.compile(rb"-[0-9A-F]{4}-[0-9A-F]{4}-")  # begins with a letter: it passes over megabytes at once


class Violation(Exception):
    """A promise that is not kept."""


def outputs(folder):
    """Path to content of what the runs wrote: identifiers numbered as they come, without what holds times."""
    contents, identifiers = {}, {}
    number = lambda match: b"ID%d" % identifiers.setdefault(match.group(0), len(identifiers))
    for path in sorted(folder.rglob("*")):
        name = str(path.relative_to(folder))
        if not path.is_file() or name.startswith(INPUTS) or name.endswith((".rsp", "mtdep.bat", "out1.txt")):
            continue  # of a tool that is told what to do: the next run makes them anew
        content = path.read_bytes()
        if name.endswith((".qrexdep", ".qrexprint", "projects.guids", "mt.dep")):
            content = b"" if content else b"empty"
        contents[name] = IDENTIFIER.sub(number, content) if HAS_IDENTIFIER.search(content) else content
    return contents


def lines(output):
    """What was said, without the figures of times."""
    text = output.decode(errors="replace").replace("\r", "")
    return {re.sub(r"\.{4,}.*", "", line).strip() for line in text.split("\n")}


class Kind:
    """A kind of run: the workspace ahead of it, and what an undisturbed one leaves and says."""

    Violation = Violation

    def __init__(self, binary, library, folder, name):
        self.binary, self.name, self.library = binary, name, library
        self.arguments, earlier = RUNS[name]
        self.start = folder / name.replace(" ", "_").replace(",", "")
        workspace = Workspace(binary, workspaces.visual() if self.arguments == VISUAL else workspaces.gcc())
        shutil.move(workspace.folder, self.start)
        age = time.time() - 100
        for path in self.start.rglob("*"):
            os.utime(path, (age, age))
        if earlier:
            self.require(self.run(self.start, earlier))
            self.before = outputs(self.start)
            time.sleep(0.02)
            for name, text in (("zoo.h", "int added;\n"), ("big.h", "$struct+ Last { $int32 a; };\n"), ("notes.txt", "the end\n")):
                with open(self.start / "tree/zoo" / name, "a") as file:
                    file.write(text)
        else:
            self.before = {}
        calls = self.start / "tools/calls"
        shutil.rmtree(calls, ignore_errors=True)
        calls.mkdir()
        end = self.copy(folder / "undisturbed")
        counts = folder / "counts"
        done = self.run(end, self.arguments, LD_PRELOAD=library, FAULT_COUNTS=str(counts))
        self.require(done)
        self.expected, self.said = outputs(end), lines(done.stdout)
        self.counts = {call: int(count) for call, count in (line.split() for line in counts.read_text().splitlines())}
        self.tools = len(list((end / "tools/calls").iterdir()))
        self.counts.update({f"keeper {call}": self.tools for call in ("fork", "send")})
        shutil.rmtree(end)

    def run(self, folder, arguments, **environment):
        return workspaces.run(self.binary, folder, "all.qrex", *arguments, **environment)

    @staticmethod
    def require(done):
        if done.returncode != 0:
            raise RuntimeError(done.stdout.decode())

    def copy(self, to):
        shutil.copytree(self.start, to, symlinks=True)  # with the times
        return to

    def check(self, folder, done, killed=False):
        """What must hold behind a run that was disturbed."""
        if done.returncode < 0 and not (killed and done.returncode == -9):
            raise Violation(f"ended by signal {-done.returncode}")
        if done.returncode not in (0, 1) and not killed:
            raise Violation(f"status {done.returncode}")
        left = outputs(folder)
        for name, content in left.items():
            if not name.startswith(("qrexsource/", "out/include/", "out/source/")) or name.endswith((".part", ".notes")):
                continue
            if content not in (self.expected.get(name), self.before.get(name)):
                raise Violation(f"{name} is torn")
        missing = [name for name in self.expected if left.get(name) != self.expected[name]]
        if missing and not killed and lines(done.stdout) <= self.said:
            raise Violation(f"missing without a line: {missing}")
        self.mended(folder)

    def mended(self, folder):
        done = self.run(folder, self.arguments)
        if done.returncode != 0:
            raise Violation("the next run fails: " + done.stdout.decode()[-600:])
        self.compare(folder, "the next run ends with other files:")
        times = lambda: {path: path.stat().st_mtime_ns for path in folder.rglob("*") if path.is_file()
                         and not path.name.endswith((".qrexdep", ".qrexprint", "projects.guids"))}
        before = times()
        self.run(folder, self.arguments)
        noted = [str(path.relative_to(folder)) for path, stamp in times().items() if before.get(path) != stamp]
        if noted:
            raise Violation(f"there is something left to do: {noted}")

    def compare(self, folder, what):
        left = outputs(folder)
        names = sorted(name for name in {**left, **self.expected} if left.get(name) != self.expected.get(name))
        if names:
            raise Violation(f"{what} {names}")


def disturbed(kind, folder, *faults):
    """One run with faults at calls, each of them call, number of the call, how and error; what it broke, or None."""
    kind.copy(folder)
    calls, points, ways, errors = (",".join(str(part) for part in column) for column in zip(*faults))
    who = "keeper" if calls.startswith("keeper ") else "tool"
    told = " and ".join(f"{call} {at} {how} {errno.errorcode.get(number, '')}" for call, at, how, number in faults)
    try:
        done = kind.run(folder, kind.arguments, LD_PRELOAD=kind.library, FAULT_CALL=calls.removeprefix("keeper "),
                   FAULT_AT=points, FAULT_HOW=ways, FAULT_ERRNO=errors, FAULT_WHO=who)
        kind.check(folder, done, "kill" in ways and who == "tool")
    except Violation as violation:
        return f"{told}: {violation}"
    except subprocess.TimeoutExpired:
        return f"{told}: no end"
    finally:
        shutil.rmtree(folder, ignore_errors=True)
    return None


def full_disk(kind, folder, kib):
    """One run on a file system of so many KiB beyond what the workspace takes; then on a roomy one."""
    folder.mkdir()
    mount = folder / "disk"
    mount.mkdir()
    subprocess.run(["mount", "-t", "tmpfs", "-o", f"size={kib}k", "tmpfs", mount], check=True)
    try:
        try:
            kind.copy(mount / "w")
        except shutil.Error:
            return "no room for the workspace"
        done = kind.run(mount / "w", kind.arguments)
        shutil.copytree(mount / "w", folder / "w", symlinks=True)
    finally:
        subprocess.run(["umount", "--lazy", mount], check=True)  # a thread that forks has our files open for a moment
    try:
        kind.check(folder / "w", done)
    except Violation as violation:
        return f"disk of {kib} KiB: {violation}"
    finally:
        shutil.rmtree(folder, ignore_errors=True)
    return None


def can_mount(folder):
    place = folder / "try"
    place.mkdir()
    mounted = subprocess.run(["mount", "-t", "tmpfs", "-o", "size=64k", "tmpfs", place], capture_output=True)
    return mounted.returncode == 0 and subprocess.run(["umount", place]).returncode == 0


def some(count, most):
    """Numbers from 1 to `count`: all of them, or `most` spread over them with both ends."""
    if count <= most:
        return range(1, count + 1)
    return sorted({1 + round(i * (count - 1) / (most - 1)) for i in range(most)})


def rows(kind, folder, short, mounts):
    """Name of the fault and a function for each run of it."""
    for call, how, number in FAULTS:
        points = some(kind.counts.get(call, 0), 3 if short else 10**6)
        name = f"{call}: {how} {errno.errorcode.get(number, '')}".strip()
        yield name, [(disturbed, kind, folder / f"{call}{at}", (call, at, how, number)) for at in points]
    chance = random.Random(kind.name)
    known = [fault for fault in FAULTS if kind.counts.get(fault[0]) and not fault[0].startswith("keeper")]
    several = [[(call, chance.randint(1, kind.counts[call]), how, number)
                for call, how, number in chance.sample(known, chance.choice([2, 3]))]
               for _ in range(4 if short else COMBINATIONS)]
    yield "two or three faults", [(disturbed, kind, folder / f"several{i}", *faults) for i, faults in enumerate(several)]
    yield from signals.rows(kind, folder, short)
    if mounts:
        taken = sum(-(-path.stat().st_size // 4096) * 4 + 4 for path in kind.start.rglob("*")) + 8
        grows = sum(-(-len(content) // 4096) * 4 + 4 for content in kind.expected.values())
        sizes = some(grows // 4, 3 if short else 60)
        yield "disk full", [(full_disk, kind, folder / f"disk{size}", taken + 4 * size) for size in sizes]


def all_rows(binary, library, folder, short, mounts, names):
    """Name of the kind of run, name of the fault and a function for each disturbed run of it."""
    for name in names or RUNS:
        kind = Kind(binary, library, folder, name)
        for fault, calls in rows(kind, folder, short, mounts):
            yield name, fault, calls
    if names:
        return
    kinds = {name: RUNS[name][0] for name in ("translate", "build")}
    runs = stamps.Runs(binary, workspaces.build_library(folder, "coarse"), outputs)
    yield from stamps.rows(runs, folder / "build", folder, kinds, short)
    yield from layout.rows(binary, library, folder, FAULTS, lambda count: some(count, 3 if short else 10**6))


def main():
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("binary", type=os.path.abspath)
    parser.add_argument("--short", action="store_true", help="some calls of each kind, within two minutes")
    parser.add_argument("--markdown", action="store_true", help="the table as docs/reliability.md has it")
    parser.add_argument("kinds", nargs="*", metavar="KIND", help="these kinds of run alone")
    options = parser.parse_intermixed_args()
    for number in signals.SIGNALS[:-1]:  # what runs in the background of a shell ignores some, and so would the runs
        signal.signal(number, signal.SIG_DFL)
    folder = Path(tempfile.mkdtemp(prefix="qrex-faults-"))
    kept = broken = 0
    if options.markdown:
        print("| Run | Fault | Disturbed runs | How all of them ended |\n|---|---|---|---|")
    try:
        library = workspaces.build_library(folder, "inject")
        mounts = can_mount(folder)
        if not mounts:
            print("full disks are left out: mount needs the superuser")
        with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
            for name, fault, calls in all_rows(options.binary, library, folder, options.short, mounts, options.kinds):
                if not calls:
                    continue
                found = [text for text in pool.map(lambda call: call[0](*call[1:]), calls) if text]
                good = len(calls) - len(found)
                kept, broken = kept + good, broken + len(found)
                if options.markdown:
                    verdict = f"{len(found)} broke a promise" if found else KEPT
                    print(f"| {name} | {fault} | {len(calls)} | {verdict} |", flush=True)
                elif found or not options.short:
                    print(f"{name:16} {fault:22} {good:5} of {len(calls)}", flush=True)
                for text in found[:20]:
                    print(f"    {text}", flush=True)
    finally:
        shutil.rmtree(folder, ignore_errors=True)
    print(f"{kept} passed, {broken} failed")
    return 1 if broken else 0


if __name__ == "__main__":
    sys.exit(main())
