"""Edits that the stamps of files hardly tell: within a step of a file system that keeps two seconds, and while a file is
copied. The run after them must end with the files of a run that begins from nothing."""

import shutil
import subprocess
import time
from pathlib import Path

from workspaces import run

STEP = 2  # seconds, of coarse.c
EDITED = ("tree/zoo/zoo.h", "tree/zoo/notes.txt", "tree/app/src/more.cpp")
COPIED = "zoo/notes.txt"  # a public file as it is


def edit(folder):
    for name in EDITED:
        with open(folder / name, "a") as file:
            file.write("int added;\n")


def whole(runs, folder, arguments):
    """What a run from nothing makes of the same sources."""
    fresh = folder.with_name(folder.name + "_fresh")
    fresh.mkdir()
    for name in ("tree", "tools"):
        shutil.copytree(folder / name, fresh / name)
    shutil.copy(folder / "all.qrex", fresh)
    runs.run(fresh, arguments)
    try:
        return runs.outputs(fresh)
    finally:
        shutil.rmtree(fresh)


def difference(runs, folder, arguments):
    made, wanted = runs.outputs(folder), whole(runs, folder, arguments)
    old = sorted(name for name in {**made, **wanted} if made.get(name) != wanted.get(name))
    return f"old for good: {old}" if old else None


def within_a_step(runs, folder, arguments):
    """On a file system of coarse stamps: run, edit and run within one step."""
    time.sleep(STEP - time.time() % STEP)
    runs.run(folder, arguments, LD_PRELOAD=runs.coarse)
    edit(folder)
    runs.run(folder, arguments, LD_PRELOAD=runs.coarse)
    return difference(runs, folder, arguments)


def while_copied(runs, folder, arguments):
    """The edit comes when the copy is being written: the source was read before."""
    (folder / "tree" / COPIED).write_text("plain\n" * 8_000_000)
    beside = (folder / "out/source" / COPIED).parent
    first = subprocess.Popen([runs.binary, "all.qrex", *arguments], cwd=folder, stdout=subprocess.DEVNULL)
    while first.poll() is None and not list(beside.glob(Path(COPIED).name + ".*")):
        time.sleep(0.001)
    edit(folder)
    first.wait()
    runs.run(folder, arguments)
    return difference(runs, folder, arguments)


class Runs:
    def __init__(self, binary, coarse, outputs):
        self.binary, self.coarse, self.outputs = binary, coarse, outputs

    def run(self, folder, arguments, **environment):
        done = run(self.binary, folder, "all.qrex", *arguments, **environment)
        if done.returncode != 0:
            raise RuntimeError(done.stdout.decode())


def disturbed(runs, start, folder, test, *arguments):
    shutil.copytree(start, folder)
    try:
        return test(runs, folder, *arguments)
    finally:
        shutil.rmtree(folder, ignore_errors=True)


def rows(runs, start, folder, kinds, short):
    """Name of the kind of run, name of the fault and a function for each disturbed run of it."""
    for name, arguments in kinds.items():
        faults = {"an edit within a step of stamps": [(within_a_step, arguments)] * (1 if short else 10),
                  "an edit while a file is copied": [(while_copied, arguments)] * (1 if short else 5)}
        for fault, tests in faults.items():
            yield name, fault, [(disturbed, runs, start, folder / f"{test[0].__name__}{i}", *test)
                                for i, test in enumerate(tests)]
